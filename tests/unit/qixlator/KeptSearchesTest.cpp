#include "qixlator/KeptSearches.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <chrono>
#include <filesystem>
#include <functional>
#include <string>
#include <thread>
#include <vector>

#include "qixlator/qvErrorsParser.h"
#include "support/FaultyAllocator.h"
#include "support/TestRoot.h"

namespace {

using qixlator::KeptSearches;

std::string explanation(const std::string& text) {
    return "<?xml version=\"1.0\"?>\n<qidocument>\n<qierror code=\"-1\">\n" + text +
           "\n</qierror>\n</qidocument>\n";
}

std::string search(const std::string& directory, std::int32_t code = -1) {
    qihtl::String output;
    qierr::Status status;
    qixlator::findErrorDescriptionFromDir(directory.c_str(), code, &output, &status);
    return status.code < 0 ? "failed" : output.c_str();
}

bool isKept(const std::string& directory, std::int32_t code = -1) {
    qihtl::String output;
    qierr::Status status;
    return KeptSearches::ofProcess().find(directory.c_str(), code, &output, &status);
}

// A search is kept as soon as nothing that it looks at was changed in the last seconds. The pauses
// leave the processor to other tests.
void searchUntilKept(const std::string& directory, std::int32_t code = -1) {
    const auto end = std::chrono::steady_clock::now() + std::chrono::seconds(30);
    while (search(directory, code), !isKept(directory, code)) {
        ASSERT_LT(std::chrono::steady_clock::now(), end) << directory;
        std::this_thread::sleep_for(std::chrono::milliseconds(20));
    }
}

// One directory of explanation files, and a change of it.
struct Change {
    const char* what;
    std::string before;
    std::function<void(const TestRoot&, const std::string&)> change;
    std::string after;
};

void rename(const TestRoot& root, const std::string& from, const std::string& to) {
    std::filesystem::rename(root.locate(from), root.locate(to));
}

void link(const TestRoot& root, const std::string& target, const std::string& path) {
    std::filesystem::remove(root.locate(path));
    std::filesystem::create_symlink(root.locate(target), root.locate(path));
}

// The times of a file, whose content is then replaced without a change of its modification time.
void replaceSecretly(const std::string& path, const std::function<void()>& replace) {
    struct stat info;
    ASSERT_EQ(stat(path.c_str(), &info), 0);
    replace();
    const timespec times[] = {info.st_atim, info.st_mtim};
    ASSERT_EQ(utimensat(AT_FDCWD, path.c_str(), times, 0), 0);
}

// Each directory contains a.txt with the text "Old." and beside it there is a directory "other"
// with the text "New.".
const std::vector<Change> changes = {
    {"nothing", "Old.", [](const TestRoot&, const std::string&) {}, "Old."},
    {"content of the same size", "Old.",
     [](const TestRoot& root, const std::string& directory) {
         root.write(directory + "/a.txt", explanation("New."));
     },
     "New."},
    {"content of the same size and time", "Old.",
     [](const TestRoot& root, const std::string& directory) {
         replaceSecretly(root.locate(directory + "/a.txt"),
                         [&] { root.write(directory + "/a.txt", explanation("New.")); });
     },
     "New."},
    {"a file replaced", "Old.",
     [](const TestRoot& root, const std::string& directory) {
         root.write(directory + "-new.txt", explanation("New."));
         rename(root, directory + "-new.txt", directory + "/a.txt");
     },
     "New."},
    {"a file removed", "Old.",
     [](const TestRoot& root, const std::string& directory) { root.remove(directory + "/a.txt"); },
     ""},
    {"a file renamed so that it is none", "Old.",
     [](const TestRoot& root, const std::string& directory) {
         rename(root, directory + "/a.txt", directory + "/a.old");
     },
     ""},
    {"an entry that cannot be examined", "Old.",
     [](const TestRoot& root, const std::string& directory) {
         root.remove(directory + "/a.txt");
         link(root, "/nowhere", directory + "/b.txt");
     },
     "failed"},
    {"the directory removed", "Old.",
     [](const TestRoot& root, const std::string& directory) { root.remove(directory); }, "failed"},
    {"the directory replaced", "Old.",
     [](const TestRoot& root, const std::string& directory) {
         root.write(directory + "-new/a.txt", explanation("New."));
         root.remove(directory);
         rename(root, directory + "-new", directory);
     },
     "New."},
    {"a directory above replaced by a link", "Old.",
     [](const TestRoot& root, const std::string& directory) {
         root.remove(directory);
         link(root, "/other", directory);
     },
     "New."},
};

class KeptSearchesTest : public testing::Test {
  protected:
    KeptSearchesTest() { KeptSearches::ofProcess().clear(); }
    ~KeptSearchesTest() override { KeptSearches::ofProcess().clear(); }

    TestRoot root;
};

TEST_F(KeptSearchesTest, EveryChangeShowsInTheNextSearch) {
    root.write("/other/a.txt", explanation("New."));
    const auto directoryOf = [](std::size_t index) { return "/errors" + std::to_string(index); };
    for (std::size_t index = 0; index < changes.size(); ++index) {
        root.write(directoryOf(index) + "/a.txt", explanation("Old."));
    }
    for (std::size_t index = 0; index < changes.size(); ++index) {
        searchUntilKept(root.locate(directoryOf(index)));
    }
    for (std::size_t index = 0; index < changes.size(); ++index) {
        const Change& change = changes[index];
        const std::string directory = root.locate(directoryOf(index));
        EXPECT_EQ(search(directory), change.before) << change.what;
        change.change(root, directoryOf(index));
        EXPECT_EQ(search(directory), change.after) << change.what;
    }
}

TEST_F(KeptSearchesTest, AnAddedFileShowsInTheNextSearch) {
    root.makeDirectory("/errors");
    root.makeDirectory("/errors/English");
    const std::string directory = root.locate("/errors");
    searchUntilKept(directory);
    EXPECT_EQ(search(directory), "");
    root.write("/errors/b.txt", explanation("New."));
    EXPECT_EQ(search(directory), "New.");
}

TEST_F(KeptSearchesTest, ALinkThatPointsElsewhereShowsInTheNextSearch) {
    root.write("/old.txt", explanation("Old."));
    root.write("/new.txt", explanation("New."));
    root.makeDirectory("/errors");
    link(root, "/old.txt", "/step");
    link(root, "/step", "/errors/a.txt");
    root.write("/one/a.txt", explanation("Old."));
    root.write("/two/a.txt", explanation("New."));
    link(root, "/one", "/linked");
    searchUntilKept(root.locate("/errors"));
    searchUntilKept(root.locate("/linked"));
    link(root, "/new.txt", "/step");
    link(root, "/two", "/linked");
    EXPECT_EQ(search(root.locate("/errors")), "New.");
    EXPECT_EQ(search(root.locate("/linked")), "New.");
}

TEST_F(KeptSearchesTest, AChangeOfPermissionsEndsTheKeeping) {
    root.write("/one/a.txt", explanation("Old."));
    root.write("/two/a.txt", explanation("Old."));
    searchUntilKept(root.locate("/one"));
    searchUntilKept(root.locate("/two"));
    ASSERT_EQ(chmod(root.locate("/one/a.txt").c_str(), 0), 0);
    ASSERT_EQ(chmod(root.locate("/two").c_str(), 0700), 0);
    EXPECT_FALSE(isKept(root.locate("/one")));
    EXPECT_FALSE(isKept(root.locate("/two")));
}

TEST_F(KeptSearchesTest, FilesThatHaveJustChangedAreReadEachTime) {
    for (const char* text : {"One.", "Two.", "Six."}) {
        root.write("/errors/a.txt", explanation(text));
        EXPECT_EQ(search(root.locate("/errors")), text);
    }
    EXPECT_FALSE(isKept(root.locate("/errors")));
    EXPECT_EQ(KeptSearches::ofProcess().size(), 0u);
}

TEST_F(KeptSearchesTest, AFailureIsNotKept) {
    root.write("/errors/a.txt", "<?xml version=\"1.0\"?>\n<qidocument>\n<qierror code=\"x\">\n");
    root.write("/good/a.txt", explanation("Old."));
    EXPECT_EQ(search(root.locate("/errors")), "failed");
    searchUntilKept(root.locate("/good"));
    EXPECT_EQ(search(root.locate("/errors")), "failed");
    EXPECT_FALSE(isKept(root.locate("/errors")));
}

TEST_F(KeptSearchesTest, TheMemoryOfTheTableIsLimited) {
    root.write("/errors/a.txt", explanation(std::string(2000, 'x')));
    const std::string directory = root.locate("/errors");
    searchUntilKept(directory);
    const std::size_t one = KeptSearches::ofProcess().size();
    EXPECT_GT(one, 2000u);
    for (std::int32_t code = 1; code <= 1000; ++code) {
        search(directory, code);
    }
    EXPECT_LE(KeptSearches::ofProcess().size(), 40u * 1024);
    EXPECT_GT(KeptSearches::ofProcess().size(), 38u * 1024);
    EXPECT_FALSE(isKept(directory)) << "the oldest";
    EXPECT_TRUE(isKept(directory, 1000)) << "the newest";
    EXPECT_EQ(search(directory), std::string(2000, 'x'));
}

TEST_F(KeptSearchesTest, LackOfMemoryAtAnyAllocationGivesTheTextOrAFailure) {
    root.write("/errors/a.txt", explanation("Old."));
    const std::string directory = root.locate("/errors");
    searchUntilKept(directory);
    for (const bool isFirst : {false, true}) {
        std::uint64_t number = 0;
        bool failed = true;
        for (; failed; ++number) {
            if (isFirst) {
                KeptSearches::ofProcess().clear();
            }
            FaultyAllocator::failAt(number);
            const std::string text = search(directory);
            failed = FaultyAllocator::hasFailed();
            FaultyAllocator::succeed();
            EXPECT_TRUE(text == "Old." || text == "failed") << text << " at request " << number;
        }
        EXPECT_GT(number, isFirst ? 5u : 1u);
    }
}

TEST_F(KeptSearchesTest, ThreadsFindTheTextWhileTheFilesChange) {
    root.write("/errors/a.txt", explanation("Old."));
    const std::string directory = root.locate("/errors");
    searchUntilKept(directory);
    std::vector<std::thread> threads;
    for (int count = 0; count < 4; ++count) {
        threads.emplace_back([&] {
            for (int round = 0; round < 200; ++round) {
                const std::string text = search(directory);
                EXPECT_TRUE(text == "Old." || text == "New.") << text;
            }
        });
    }
    root.write("/new.txt", explanation("New."));
    rename(root, "/new.txt", "/errors/a.txt");
    EXPECT_EQ(search(directory), "New.");
    for (std::thread& thread : threads) {
        thread.join();
    }
}

TEST(FileIdentityTest, AFileIsSettledWhenItsLastChangeIsSecondsAgo) {
    struct stat info = {};
    info.st_mtim = {100, 999999999};
    info.st_ctim = {90, 0};
    const auto isSettledAt = [&](long seconds) {
        return qisysq::FileIdentity(info).isSettled({seconds, 0});
    };
    EXPECT_FALSE(isSettledAt(50)) << "the clock was set back";
    EXPECT_FALSE(isSettledAt(100));
    EXPECT_FALSE(isSettledAt(102));
    EXPECT_TRUE(isSettledAt(103));
    info.st_ctim = {110, 0};
    EXPECT_FALSE(isSettledAt(112));
    EXPECT_TRUE(isSettledAt(113));
}

TEST(FileIdentityTest, EachMemberDistinguishes) {
    struct stat info = {};
    const qisysq::FileIdentity identity(info);
    EXPECT_EQ(identity, qisysq::FileIdentity(info));
    const auto differsWith = [&](const std::function<void(struct stat&)>& change) {
        struct stat changed = {};
        change(changed);
        return !(qisysq::FileIdentity(changed) == identity);
    };
    EXPECT_TRUE(differsWith([](struct stat& changed) { changed.st_dev = 1; }));
    EXPECT_TRUE(differsWith([](struct stat& changed) { changed.st_ino = 1; }));
    EXPECT_TRUE(differsWith([](struct stat& changed) { changed.st_size = 1; }));
    EXPECT_TRUE(differsWith([](struct stat& changed) { changed.st_mtim.tv_sec = 1; }));
    EXPECT_TRUE(differsWith([](struct stat& changed) { changed.st_mtim.tv_nsec = 1; }));
    EXPECT_TRUE(differsWith([](struct stat& changed) { changed.st_ctim.tv_sec = 1; }));
    EXPECT_TRUE(differsWith([](struct stat& changed) { changed.st_ctim.tv_nsec = 1; }));
}

}  // namespace
