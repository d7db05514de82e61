#include <dirent.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include <cerrno>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <filesystem>
#include <string>
#include <utility>
#include <vector>

#include "documents.h"
#include "qixlator/DirectoryWalker.h"
#include "qixlator/qvErrorsParser.h"
#include "support/FaultyAllocator.h"
#include "support/TestRoot.h"

namespace {

// The same directory under a path of this length.
std::string lengthened(std::string path, std::size_t length) {
    while (path.size() + 1 < length) {
        path += "/.";
    }
    return path.append(length - path.size(), '/');
}

// While it exists, every directory appears to contain one entry, whose name is longer than a file
// system allows.
class LongName {
  public:
    explicit LongName(std::size_t length) {
        block.resize(offsetof(dirent, d_name) + length + 1);
        std::memset(block.data() + offsetof(dirent, d_name), 'n', length);
        pending = reinterpret_cast<dirent*>(block.data());
    }
    LongName(const LongName&) = delete;
    LongName& operator=(const LongName&) = delete;
    ~LongName() { pending = nullptr; }

    static dirent* take() { return std::exchange(pending, nullptr); }

  private:
    static inline dirent* pending = nullptr;
    std::vector<char> block;
};

class ExplanationFilesTest : public testing::Test {
  protected:
    // Searches one file of this content.
    std::string inFile(const std::string& content, std::int32_t code = -1) {
        root.write("/file.txt", content);
        qixlator::findErrorDescriptionFromFile(root.locate("/file.txt").c_str(), code, &output,
                                               &status);
        return text();
    }

    std::string inDirectory(const std::string& directory, std::int32_t code = -1) {
        qixlator::findErrorDescriptionFromDir(root.locate(directory).c_str(), code, &output,
                                              &status);
        return text();
    }

    // Searches the directory /dir under a path of this length.
    std::string inLongDirectory(std::size_t length) {
        qixlator::findErrorDescriptionFromDir(lengthened(root.locate("/dir"), length).c_str(), -1,
                                              &output, &status);
        return text();
    }

    std::string inErrorsDirectory(const std::string& directory, std::int32_t language) {
        qixlator::findErrorDescriptionFromErrorsDir(root.locate(directory).c_str(), -1, language,
                                                    &output, &status);
        return text();
    }

    std::string text() const { return std::string(output.c_str(), output.length()); }

    bool reported(const std::string& part) const {
        return status.json != nullptr && std::string(status.json).find(part) != std::string::npos;
    }

    TestRoot root;
    qihtl::String output;
    qierr::Status status;
};

// ---- One file -----------------------------------------------------------------------------------

TEST_F(ExplanationFilesTest, FindsTheDescriptionOfTheCode) {
    EXPECT_EQ(inFile(document(block("-2", "First.\n") + block("-1", "Second.\n"))), "Second.");
    EXPECT_EQ(status.code, 0);
}

TEST_F(ExplanationFilesTest, InnerLineEndsAreKeptAndTrailingOnesRemoved) {
    EXPECT_EQ(inFile(document(block("-1", "One.\n\nTwo.\r\n\n"))), "One.\n\nTwo.");
}

TEST_F(ExplanationFilesTest, AnUnknownCodeHasNoTextAndIsNotAFailure) {
    EXPECT_EQ(inFile(document(block("-2", "First.\n"))), "");
    EXPECT_EQ(status.code, 0);
}

TEST_F(ExplanationFilesTest, TheFirstBlockOfACodeWins) {
    EXPECT_EQ(inFile(document(block("-1", "First.\n") + block("-1", "Second.\n"))), "First.");
}

TEST_F(ExplanationFilesTest, TagsIgnoreCase) {
    EXPECT_EQ(inFile("<?XML VERSION=\"1.0\"?>\n<QIDocument>\n<QIERROR CODE=\"-1\">\n"
                     "Text.\n</QIERROR>\n</QIDOCUMENT>\n"),
              "Text.");
}

TEST_F(ExplanationFilesTest, CodesMayBeHexadecimal) {
    EXPECT_EQ(inFile(document(block("0x1A", "Text.\n")), 26), "Text.");
    EXPECT_EQ(inFile(document(block("-0x1A", "Text.\n")), -26), "Text.");
}

TEST_F(ExplanationFilesTest, ANumberBeyondACodeDoesNotWrapToOne) {
    for (const char* number : {"0xFFFC2C40", "4294716480", "-4295218112", "0x1FFFFFFFFFFFC2C40"}) {
        EXPECT_EQ(inFile(document(block(number, "Wrong.\n")), -250816), "") << number;
    }
    for (const char* number : {"4294967295", "0xFFFFFFFFFFFFFFFF", "99999999999999999999"}) {
        EXPECT_EQ(inFile(document(block(number, "Wrong.\n")), -1), "") << number;
    }
    EXPECT_EQ(inFile(document(block("-99999999999999999999", "Wrong.\n")), 0), "");
    EXPECT_EQ(inFile(document(block("2147483648", "Wrong.\n")), INT32_MIN), "");
    EXPECT_EQ(inFile(document(block("-2147483649", "Wrong.\n")), INT32_MAX), "");
    EXPECT_EQ(status.code, 0);
}

TEST_F(ExplanationFilesTest, TheFirstAndTheLastCodeAreFound) {
    EXPECT_EQ(inFile(document(block("-2147483648", "Text.\n")), INT32_MIN), "Text.");
    EXPECT_EQ(inFile(document(block("-0x80000000", "Text.\n")), INT32_MIN), "Text.");
    EXPECT_EQ(inFile(document(block("0x7FFFFFFF", "Text.\n")), INT32_MAX), "Text.");
}

TEST_F(ExplanationFilesTest, TheRestOfATagLineIsIgnored) {
    EXPECT_EQ(
        inFile(std::string(heading) + "<qierror code=\"-1\" since=\"2\"> not the text\nText.\n"
                                      "</qierror> more\n</qidocument>\n"),
        "Text.");
}

TEST_F(ExplanationFilesTest, AFileOfAnotherFormIsSkippedWithoutAFailure) {
    for (const std::string& content :
         {std::string(), std::string("Notes\n") + block("-1", "Text.\n"),
          std::string("<?xml version=\"1.0\"?>\n"),
          "<?xml version=\"1.0\"?>\n<other>\n" + block("-1", "Text.\n"),
          "<?xml version=\"1.1\"?>\n<qidocument>\n" + block("-1", "Text.\n"),
          std::string(heading)}) {
        EXPECT_EQ(inFile(content), "") << content;
        EXPECT_EQ(status.code, 0) << content;
    }
}

TEST_F(ExplanationFilesTest, NothingAfterTheEndMarkerIsRead) {
    EXPECT_EQ(inFile(document("") + block("-1", "Text.\n")), "");
}

TEST_F(ExplanationFilesTest, AMissingEndMarkerIsNotAFailure) {
    EXPECT_EQ(inFile(heading + block("-2", "Text.\n")), "");
    EXPECT_EQ(status.code, 0);
}

TEST_F(ExplanationFilesTest, CommentsAndUnknownTagsAndOtherLinesAreSkipped) {
    EXPECT_EQ(inFile(document("<foo>\nany line\n\n<qicomment>\n" + block("-1", "Not this.\n") +
                              "</qicomment>\n" + block("-1", "Text.\n"))),
              "Text.");
    EXPECT_EQ(status.code, 0);
}

TEST_F(ExplanationFilesTest, AnUnfinishedCommentExtendsToTheEnd) {
    EXPECT_EQ(inFile(document("<qicomment>\n" + block("-1", "Text.\n"))), "");
    EXPECT_EQ(status.code, 0);
}

TEST_F(ExplanationFilesTest, OnlyTheClosingTagCountsInsideABlock) {
    EXPECT_EQ(inFile(document(block("-1",
                                    "<b>\n</qidocument>\n<qicomment>\n<qierror code=\"-2\">\n"
                                    " &lt; </qierror>\n"))),
              "<b>\n</qidocument>\n<qicomment>\n<qierror code=\"-2\">\n &lt; </qierror>");
}

TEST_F(ExplanationFilesTest, ALongLineIsReadCompletely) {
    const std::string longLine = std::string(3000, 'x') + "end";
    EXPECT_EQ(inFile(document(block("-1", longLine + "\n"))), longLine);
}

TEST_F(ExplanationFilesTest, APieceOfALongLineMayEndTheBlock) {
    const std::string firstPiece(1023, 'x');
    EXPECT_EQ(inFile(document(block("-1", firstPiece + "</qierror>yyy\n"))), firstPiece);
}

TEST_F(ExplanationFilesTest, ABlockWithoutLinesHasNoText) {
    EXPECT_EQ(inFile(document(block("-1", "") + block("-1", "Second.\n"))), "");
    EXPECT_EQ(status.code, 0);
}

TEST_F(ExplanationFilesTest, ABlockOfOnlyLineEndsIsReturnedUnchanged) {
    EXPECT_EQ(inFile(document(block("-1", "\n\r\n"))), "\n\r\n");
}

TEST_F(ExplanationFilesTest, ACodeThatIsNotANumberIsAFailure) {
    EXPECT_EQ(inFile(document(block("none", "Text.\n"))), "");
    EXPECT_EQ(status.code, -52006);
    EXPECT_TRUE(reported("\"error_constant\":\"qiapalerr_resourceNotFound\""));
    EXPECT_TRUE(
        reported("\"qixlator_debug\":{\"debug\":"
                 "\"Could not successfully read the status data!\",\"sscanf\":0}"))
        << status.json;
}

TEST_F(ExplanationFilesTest, ATagLineThatEndsBeforeItsCodeIsReportedAsTheEndOfTheText) {
    EXPECT_EQ(inFile(document("<qierror code=\"\nText.\n</qierror>\n"), 0), "");
    EXPECT_EQ(status.code, -52006);
    EXPECT_TRUE(
        reported("\"qixlator_debug\":{\"debug\":"
                 "\"Could not successfully read the status data!\",\"sscanf\":-1}"))
        << status.json;
}

TEST_F(ExplanationFilesTest, AnUnfinishedBlockIsAFailureWhateverItsCode) {
    EXPECT_EQ(inFile(std::string(heading) + "<qierror code=\"-2\">\nText.\n"), "");
    EXPECT_EQ(status.code, -52006);
    EXPECT_TRUE(
        reported("\"debug\":\"Bad explanation file. Could not find the end of the status "
                 "code definition !\"}"))
        << status.json;
}

TEST_F(ExplanationFilesTest, AnUnfinishedBlockOfTheCodeHasNoText) {
    EXPECT_EQ(inFile(std::string(heading) + "<qierror code=\"-1\">\nText.\n"), "");
    EXPECT_EQ(status.code, -52006);
}

TEST_F(ExplanationFilesTest, ALineThatBeginsWithANulIsAFailure) {
    EXPECT_EQ(inFile(document(std::string("\0x\n", 3) + block("-1", "Text.\n"))), "");
    EXPECT_EQ(status.code, -52006);
    EXPECT_TRUE(reported("\"debug\":\"Bad explanation file. Unidentified section heading !\"}"))
        << status.json;
}

TEST_F(ExplanationFilesTest, AFileThatCannotBeOpenedIsAFailure) {
    const std::string path = root.locate("/missing.txt");
    qixlator::findErrorDescriptionFromFile(path.c_str(), -1, &output, &status);
    EXPECT_EQ(status.code, -52006);
    EXPECT_TRUE(
        reported("\"qixlator_debug\":{\"debug\":\"Could not open status explanations "
                 "file\",\"path\":\"" +
                 path + "\"}"))
        << status.json;
}

TEST_F(ExplanationFilesTest, ASearchOnlyClearsTheOutputWhenTheStatusIsNegative) {
    root.write("/errors/English/a.txt", document(block("-1", "Text.\n")));
    output.assign("old", &status);
    status.code = -7;
    EXPECT_EQ(inFile(document(block("-1", "Text.\n"))), "");
    EXPECT_EQ(inDirectory("/errors/English"), "");
    EXPECT_EQ(inErrorsDirectory("/errors", 0), "");
    EXPECT_EQ(status.code, -7);
}

// ---- A directory --------------------------------------------------------------------------------

TEST_F(ExplanationFilesTest, FindsTheCodeInAnyExplanationFileOfTheDirectory) {
    root.write("/dir/a.txt", document(block("-2", "Two.\n")));
    root.write("/dir/b.err", document(block("-1", "One.\n")));
    root.write("/dir/notes.md", "no explanation file");
    EXPECT_EQ(inDirectory("/dir"), "One.");
    EXPECT_EQ(inDirectory("/dir", -2), "Two.");
    EXPECT_EQ(inDirectory("/dir", -3), "");
    EXPECT_EQ(status.code, 0);
}

TEST_F(ExplanationFilesTest, OnlyTheExactExtensionsCount) {
    for (const char* name : {"notes.TXT", "notes.err.bak", "notes", "txt", "notes.txtx"}) {
        root.write(std::string("/dir/") + name, document(block("-1", name)));
    }
    EXPECT_EQ(inDirectory("/dir"), "");
    root.write("/dir/.txt", document(block("-1", "Found.\n")));
    EXPECT_EQ(inDirectory("/dir"), "Found.");
}

TEST_F(ExplanationFilesTest, SubdirectoriesAndTheirFilesAreNotRead) {
    root.write("/dir/below.txt/a.txt", document(block("-1", "Text.\n")));
    EXPECT_EQ(inDirectory("/dir"), "");
    EXPECT_EQ(status.code, 0);
}

TEST_F(ExplanationFilesTest, APipeIsNotRead) {
    root.makeDirectory("/dir");
    ASSERT_EQ(mkfifo(root.locate("/dir/pipe.txt").c_str(), 0600), 0);
    EXPECT_EQ(inDirectory("/dir"), "");
    EXPECT_EQ(status.code, 0);
}

TEST_F(ExplanationFilesTest, AnEmptyDirectoryHasNoTextAndIsNotAFailure) {
    root.makeDirectory("/dir");
    EXPECT_EQ(inDirectory("/dir"), "");
    EXPECT_EQ(status.code, 0);
}

TEST_F(ExplanationFilesTest, TheSearchContinuesAfterAnEmptyBlock) {
    root.write("/dir/a.txt", document(block("-1", "")));
    root.write("/dir/b.txt", document(block("-1", "Text.\n")));
    root.write("/dir/c.txt", document(block("-1", "")));
    EXPECT_EQ(inDirectory("/dir"), "Text.");
}

TEST_F(ExplanationFilesTest, ABadFileStopsTheSearch) {
    root.write("/dir/bad.txt", document(block("none", "")));
    EXPECT_EQ(inDirectory("/dir"), "");
    EXPECT_EQ(status.code, -52006);
}

TEST_F(ExplanationFilesTest, AMissingDirectoryIsAFailure) {
    EXPECT_EQ(inDirectory("/missing"), "");
    EXPECT_EQ(status.code, -52006);
    EXPECT_TRUE(reported("\"internal_error\":{\"api\":\"errno\",\"code\":" +
                         std::to_string(ENOENT) + ",\"string\":\"" + std::strerror(ENOENT) +
                         "\"},\"qixlator_debug\":{\"debug\":\"open dir failed\",\"path\":\"" +
                         root.locate("/missing") + "\"}"))
        << status.json;
}

TEST_F(ExplanationFilesTest, ADirectoryThatCannotBeOpenedIsReportedAsMissing) {
    root.write("/file", "");
    EXPECT_EQ(inDirectory("/file"), "");
    EXPECT_TRUE(reported("\"code\":" + std::to_string(ENOENT) + ",")) << status.json;
}

TEST_F(ExplanationFilesTest, AnEmptyPathAndATooLongPathAreFailures) {
    qixlator::findErrorDescriptionFromDir("", -1, &output, &status);
    EXPECT_EQ(status.code, -52006);
    EXPECT_TRUE(reported("\"code\":" + std::to_string(EINVAL) + ",")) << status.json;
    qierr::Status longStatus;
    qixlator::findErrorDescriptionFromDir(std::string(4096, 'd').c_str(), -1, &output, &longStatus);
    EXPECT_EQ(longStatus.code, -52006);
    EXPECT_NE(std::string::npos,
              std::string(longStatus.json).find("\"code\":" + std::to_string(ENAMETOOLONG) + ","));
}

TEST_F(ExplanationFilesTest, AnEntryWhoseTypeCannotBeReadStopsTheSearch) {
    root.makeDirectory("/dir");
    std::filesystem::create_symlink("nowhere", root.locate("/dir/link.txt"));
    EXPECT_EQ(inDirectory("/dir"), "");
    EXPECT_EQ(status.code, -52006);
    EXPECT_TRUE(
        reported("\"internal_error\":{\"api\":\"errno\",\"code\":" + std::to_string(ENOENT) + ","));
    EXPECT_TRUE(reported("\"qixlator_debug\":{\"qixlator\":\"get file info failed\",\"path\":\"" +
                         root.locate("/dir") + "\"}"))
        << status.json;
}

TEST_F(ExplanationFilesTest, AnEntryWhosePathIsTooLongStopsTheSearch) {
    root.write("/dir/explain.txt", document(block("-1", "Text.\n")));
    EXPECT_EQ(inLongDirectory(4096 - 1 - 11), "");
    EXPECT_EQ(status.code, -52006);
    EXPECT_TRUE(
        reported("\"internal_error\":{\"api\":\"errno\",\"code\":" + std::to_string(ENAMETOOLONG) +
                 ",\"string\":\"" + std::strerror(ENAMETOOLONG) +
                 "\"},\"qixlator_debug\":{\"qixlator\":\"get file info failed\","
                 "\"path\":\""))
        << status.json;
}

TEST_F(ExplanationFilesTest, AnEntryWhosePathJustFitsIsRead) {
    root.write("/dir/explain.txt", document(block("-1", "Text.\n")));
    EXPECT_EQ(inLongDirectory(4096 - 1 - 12), "Text.");
    EXPECT_EQ(status.code, 0);
}

// The operating system refuses such paths and names too, but only after they have been written.
TEST_F(ExplanationFilesTest, NothingOfAPathThatIsTooLongIsWritten) {
    root.makeDirectory("/dir");
    qixlator::DirectoryWalker walker;
    ASSERT_TRUE(walker.open(lengthened(root.locate("/dir"), 4095).c_str()));
    qixlator::FileEntry entry = {};
    EXPECT_EQ(walker.describe(&entry), ENAMETOOLONG);
    EXPECT_STREQ(entry.path, "");
}

TEST_F(ExplanationFilesTest, NothingOfANameThatIsTooLongIsWritten) {
    root.makeDirectory("/dir");
    const LongName longName(256);
    qixlator::DirectoryWalker walker;
    ASSERT_TRUE(walker.open(root.locate("/dir").c_str()));
    qixlator::FileEntry entry = {};
    EXPECT_EQ(walker.describe(&entry), ENAMETOOLONG);
    EXPECT_STREQ(entry.name, "");
}

TEST_F(ExplanationFilesTest, AnEntryWhoseNameIsTooLongStopsTheSearch) {
    root.write("/dir/a.txt", document(block("-1", "Text.\n")));
    const LongName longName(256);
    EXPECT_EQ(inDirectory("/dir"), "");
    EXPECT_EQ(status.code, -52006);
    EXPECT_TRUE(reported(
        "\"internal_error\":{\"api\":\"errno\",\"code\":" + std::to_string(ENAMETOOLONG) + ","))
        << status.json;
    EXPECT_TRUE(reported("\"qixlator\":\"get file info failed\""));
}

TEST_F(ExplanationFilesTest, LackOfMemoryForTheSearchIsReported) {
    root.makeDirectory("/dir");
    for (int allocation = 0; allocation < 2; ++allocation) {
        qierr::Status failure;
        FaultyAllocator::failAt(allocation);
        qixlator::findErrorDescriptionFromDir(root.locate("/dir").c_str(), -1, &output, &failure);
        FaultyAllocator::succeed();
        EXPECT_EQ(failure.code, -52000);
        EXPECT_NE(std::string::npos,
                  std::string(failure.json)
                      .find("\"qixlator_debug\":{\"qixlator\":\"failed to allocate memory\"}"))
            << failure.json;
    }
}

// ---- An errors directory ------------------------------------------------------------------------

TEST_F(ExplanationFilesTest, TheLanguagesDirectoryComesBeforeItsParent) {
    root.write("/errors/all.txt", document(block("-1", "Parent.\n")));
    root.write("/errors/German/a.txt", document(block("-1", "German.\n")));
    root.makeDirectory("/errors/French");
    EXPECT_EQ(inErrorsDirectory("/errors", 2), "German.");
    EXPECT_EQ(inErrorsDirectory("/errors", 1), "Parent.");
    EXPECT_EQ(status.code, 0);
}

TEST_F(ExplanationFilesTest, AMissingLanguageDirectoryIsAFailureWithoutFallback) {
    root.write("/errors/all.txt", document(block("-1", "Parent.\n")));
    EXPECT_EQ(inErrorsDirectory("/errors", 3), "");
    EXPECT_EQ(status.code, -52006);
    EXPECT_TRUE(reported("\"debug\":\"open dir failed\",\"path\":\"" +
                         root.locate("/errors/Japanese") + "\""))
        << status.json;
}

TEST_F(ExplanationFilesTest, EachLanguageHasItsDirectory) {
    const char* directories[] = {"English", "French", "German", "Japanese", "Korean", "ChineseS"};
    for (int language = 0; language < 6; ++language) {
        EXPECT_STREQ(qixlator::convertLangToDir(language, &status), directories[language]);
    }
    EXPECT_EQ(status.code, 0);
}

TEST_F(ExplanationFilesTest, AnUnknownLanguageIsAFailure) {
    for (const int language : {6, -1}) {
        qierr::Status failure;
        EXPECT_STREQ(qixlator::convertLangToDir(language, &failure), "");
        EXPECT_EQ(failure.code, -52005);
        EXPECT_NE(
            std::string::npos,
            std::string(failure.json)
                .find("\"qixlator_debug\":{\"qverrorsparser\":\"invalid language\",\"lang\":" +
                      std::to_string(language) + "}"))
            << failure.json;
    }
}

}  // namespace

// The compiler maps readdir to one of the two, depending on the size of file offsets.
extern "C" {
dirent* __real_readdir(DIR* directory);
dirent64* __real_readdir64(DIR* directory);

dirent* __wrap_readdir(DIR* directory) {
    dirent* const entry = LongName::take();
    return entry != nullptr ? entry : __real_readdir(directory);
}

dirent64* __wrap_readdir64(DIR* directory) {
    auto* const entry = reinterpret_cast<dirent64*>(LongName::take());
    return entry != nullptr ? entry : __real_readdir64(directory);
}
}
