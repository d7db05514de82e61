#include <dirent.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/resource.h>
#include <unistd.h>

#include <atomic>
#include <filesystem>
#include <fstream>
#include <string>
#include <thread>

#include "documents.h"
#include "qixlator/qvErrorsParser.h"
#include "support/FaultyAllocator.h"
#include "support/TestRoot.h"

namespace {

int openDescriptors() {
    int count = 0;
    DIR* directory = opendir("/proc/self/fd");
    while (readdir(directory) != nullptr) {
        ++count;
    }
    closedir(directory);
    return count;
}

// Lets this process open only a few more descriptors.
class FewDescriptors {
  public:
    explicit FewDescriptors(rlim_t more) {
        getrlimit(RLIMIT_NOFILE, &before);
        const int next = dup(STDIN_FILENO);
        close(next);
        const rlimit few{static_cast<rlim_t>(next) + more, before.rlim_max};
        setrlimit(RLIMIT_NOFILE, &few);
    }
    ~FewDescriptors() { setrlimit(RLIMIT_NOFILE, &before); }
    FewDescriptors(const FewDescriptors&) = delete;
    FewDescriptors& operator=(const FewDescriptors&) = delete;

  private:
    rlimit before{};
};

// The files on the disk are not under this program's control: they may hold anything, and may
// change at any time.
class HostileExplanationFilesTest : public testing::Test {
  protected:
    std::string search(const std::string& directory) {
        status.code = 0;
        qixlator::findErrorDescriptionFromDir(root.locate(directory).c_str(), -1, &output, &status);
        return std::string(output.c_str(), output.length());
    }

    TestRoot root;
    qihtl::String output;
    qierr::Status status;
};

TEST_F(HostileExplanationFilesTest, AFileThatDoesNotOpenStopsTheSearch) {
    root.write("/dir/a.txt", document(block("-1", "Text.\n")));
    const std::string directory = root.locate("/dir");
    qihtl::String text;
    qierr::Status failure;
    {
        // One for the directory, none for the file, and none for a sanitizer that inspects *this.
        const FewDescriptors few(1);
        qixlator::findErrorDescriptionFromDir(directory.c_str(), -1, &text, &failure);
    }
    EXPECT_TRUE(text.empty());
    EXPECT_EQ(failure.code, -52006);
    EXPECT_NE(std::string::npos,
              std::string(failure.json)
                  .find("\"qixlator_debug\":{\"debug\":\"Could not open status explanations "
                        "file\",\"path\":\"" +
                        directory + "/a.txt\"}"))
        << failure.json;
}

TEST_F(HostileExplanationFilesTest, EmptyFilesAreSkipped) {
    root.write("/dir/a.txt", "");
    root.write("/dir/b.txt", document(block("-1", "Text.\n")));
    root.write("/dir/c.err", "");
    EXPECT_EQ(search("/dir"), "Text.");
    EXPECT_EQ(status.code, 0);
}

TEST_F(HostileExplanationFilesTest, BytesThatAreNotUtf8AreReturnedUnchanged) {
    root.write("/dir/a.txt", document("\xFF\xFE\n" + block("-1", "a\xFF\xC3(\xED\xA0\x80\n")));
    EXPECT_EQ(search("/dir"), "a\xFF\xC3(\xED\xA0\x80");
}

TEST_F(HostileExplanationFilesTest, ANulEndsALineOfTextButNotTheFile) {
    root.write("/dir/a.txt", document(block("-1", std::string("one\0two\n", 8) +
                                                      std::string("\0\n", 2) + "\n" + "three\n")));
    EXPECT_EQ(search("/dir"), "one\nthree");
}

TEST_F(HostileExplanationFilesTest, ACodeInSeveralFilesHasOneOfTheTexts) {
    root.write("/dir/a.txt", document(block("-1", "First.\n")));
    root.write("/dir/b.txt", document(block("-1", "Second.\n")));
    EXPECT_THAT(search("/dir"), testing::AnyOf("First.", "Second."));
    EXPECT_EQ(status.code, 0);
}

TEST_F(HostileExplanationFilesTest, AHugeFileTakesNoMemory) {
    root.write("/dir/a.txt", heading);
    {
        std::ofstream file(root.locate("/dir/a.txt"), std::ios::app);
        const std::string other = block("-2", std::string(4000, 'x') + "\n");
        for (int count = 0; count < 8000; ++count) {
            file << other;
        }
        file << block("-1", "Text.\n") << "</qidocument>\n";
    }
    ASSERT_LT(32000000u, std::filesystem::file_size(root.locate("/dir/a.txt")));
    FaultyAllocator::succeed();
    const std::int64_t before = FaultyAllocator::liveBytes();
    EXPECT_EQ(search("/dir"), "Text.");
    EXPECT_GT(20000, FaultyAllocator::peakBytes() - before);
}

TEST_F(HostileExplanationFilesTest, ALineOfMillionsOfBytesIsSkippedOrReadCompletely) {
    const std::string line(16000000, 'x');
    root.write("/dir/a.txt",
               document(line + "\n" + block("-2", line + "\n") + block("-1", line + "end\n")));
    EXPECT_EQ(search("/dir"), line + "end");
}

TEST_F(HostileExplanationFilesTest, ADescriptionWithoutMemoryIsAFailure) {
    root.write("/dir/a.txt", document(block("-1", std::string(100000, 'x') + "\n")));
    const std::int64_t blocks = FaultyAllocator::liveBlocks();
    int failures = 0;
    bool hasFailed = true;
    for (int allocation = 0; hasFailed; ++allocation) {
        qihtl::String text;
        qierr::Status failure;
        FaultyAllocator::failAt(allocation);
        qixlator::findErrorDescriptionFromDir(root.locate("/dir").c_str(), -1, &text, &failure);
        hasFailed = FaultyAllocator::hasFailed();
        FaultyAllocator::succeed();
        failures += failure.code == -52000 ? 1 : 0;
        // Without memory to record the search it succeeds all the same.
        EXPECT_EQ(failure.code == 0 ? 100000u : 0u, text.length()) << allocation;
    }
    // The two for the search, and the text as it grows.
    EXPECT_LE(10, failures);
    EXPECT_EQ(FaultyAllocator::liveBlocks(), blocks);
}

TEST_F(HostileExplanationFilesTest, NoDescriptorIsLeftOpenWhateverTheSearchFinds) {
    root.write("/found/a.txt", document(block("-1", "Text.\n")));
    root.write("/none/a.txt", document(block("-2", "Text.\n")));
    root.write("/empty/a.txt", "");
    root.write("/heading/a.txt", heading);
    root.write("/code/a.txt", document(block("none", "")));
    root.write("/unfinished/a.txt", std::string(heading) + "<qierror code=\"-1\">\nText.\n");
    root.write("/nul/a.txt", document(std::string("\0\n", 2)));
    root.makeDirectory("/link");
    std::filesystem::create_symlink("nowhere", root.locate("/link/a.txt"));
    const int before = openDescriptors();
    for (int count = 0; count < 500; ++count) {
        for (const char* directory : {"/found", "/none", "/empty", "/heading", "/code",
                                      "/unfinished", "/nul", "/link", "/missing"}) {
            search(directory);
        }
    }
    EXPECT_EQ(openDescriptors(), before);
}

// Repeatedly creates and removes a directory with two files while it exists.
class Flicker {
  public:
    explicit Flicker(const TestRoot& root)
        : root(root), thread([this] {
              while (!stopped) {
                  this->root.write("/dir/a.txt", document(block("-1", "Text.\n")));
                  this->root.write("/dir/b.txt", document(block("-1", "Text.\n")));
                  ++rounds;
                  this->root.remove("/dir");
              }
          }) {}
    ~Flicker() {
        stopped = true;
        thread.join();
    }
    int count() const { return rounds; }

  private:
    const TestRoot& root;
    std::atomic<bool> stopped{false};
    std::atomic<int> rounds{0};
    std::thread thread;
};

TEST_F(HostileExplanationFilesTest, FilesThatChangeDuringASearchResultInTheTextNoneOrAFailure) {
    const int before = openDescriptors();
    int found = 0;
    int failed = 0;
    {
        const Flicker flicker(root);
        while (flicker.count() < 1000 || found == 0 || failed == 0) {
            const std::string text = search("/dir");
            ASSERT_TRUE(status.code == 0 || status.code == -52006) << status.code;
            ASSERT_TRUE(text == "Text." || text.empty()) << text;
            ASSERT_TRUE(status.code == 0 || text.empty()) << text;
            found += text.empty() ? 0 : 1;
            failed += status.code < 0 ? 1 : 0;
        }
    }
    EXPECT_EQ(openDescriptors(), before);
}

}  // namespace
