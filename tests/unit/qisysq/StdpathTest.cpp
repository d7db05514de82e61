#include "qisysq/stdpath.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <string>

#include "support/TestRoot.h"

namespace {

class StdpathTest : public testing::Test {
  protected:
    void TearDown() override {
        if (hadTmpdir) {
            setenv("TMPDIR", oldTmpdir.c_str(), 1);
        } else {
            unsetenv("TMPDIR");
        }
    }

    std::string get(void (*function)(qihtl::String*, qierr_Status*)) {
        qierr::Status status;
        qihtl::String directory;
        function(&directory, &status);
        EXPECT_EQ(0, status.code);
        return std::string(directory.c_str(), directory.length());
    }

    std::string sharedDirFor(const std::string& content) {
        root.write("/etc/qinstal/share/share.dir", content);
        return get(qisysq::getSharedDir);
    }

    TestRoot root;
    const bool hadTmpdir = std::getenv("TMPDIR") != nullptr;
    const std::string oldTmpdir = hadTmpdir ? std::getenv("TMPDIR") : "";
};

TEST_F(StdpathTest, WithoutTheFileTheSharedDirectoryIsTheStandardOne) {
    EXPECT_EQ(root.locate("/usr/local/qinstal/share"), get(qisysq::getSharedDir));
}

TEST_F(StdpathTest, TheTextOfTheFileIsTheSharedDirectoryAsItStands) {
    EXPECT_EQ("/opt/shared", sharedDirFor("/opt/shared/\n"));
}

TEST_F(StdpathTest, TrailingBlanksSlashesAndNulBytesAndLeadingBlanksAreRemoved) {
    EXPECT_EQ("/a/b", sharedDirFor("/a/b//  \n"));
    EXPECT_EQ("/a b", sharedDirFor(" \t\r\n\v\f/a b \v\f\t/\r\n"));
    EXPECT_EQ("/a", sharedDirFor(std::string("/a/\0\0 \0", 7)));
}

TEST_F(StdpathTest, AnEmptyFileGivesAnEmptySharedDirectory) {
    EXPECT_EQ("", sharedDirFor(""));
    EXPECT_EQ("", sharedDirFor("/\n"));
}

TEST_F(StdpathTest, AFileThatCannotBeReadCountsAsMissing) {
    root.makeDirectory("/etc/qinstal/share/share.dir");
    EXPECT_EQ(root.locate("/usr/local/qinstal/share"), get(qisysq::getSharedDir));
}

TEST_F(StdpathTest, TheCommonApplicationDataLiesBelowTheRoot) {
    EXPECT_EQ(root.locate("/var/local/qinstal"), get(qisysq::getCommonAppDataDir));
}

TEST_F(StdpathTest, TheTemporaryDirectoryComesFromTheEnvironment) {
    setenv("TMPDIR", "/some/where", 1);
    EXPECT_EQ("/some/where", get(qisysq::getTempDir));
    setenv("TMPDIR", "", 1);
    EXPECT_EQ("", get(qisysq::getTempDir));
    unsetenv("TMPDIR");
    EXPECT_EQ("/tmp", get(qisysq::getTempDir));
}

TEST_F(StdpathTest, NothingIsDoneWhenTheStatusIsNegative) {
    for (auto function : {qisysq::getSharedDir, qisysq::getCommonAppDataDir, qisysq::getTempDir}) {
        qierr::Status status;
        status.code = -1;
        qihtl::String directory;
        function(&directory, &status);
        EXPECT_EQ(-1, status.code);
        EXPECT_TRUE(directory.empty());
    }
}

}  // namespace
