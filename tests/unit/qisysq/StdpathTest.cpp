#include "qisysq/stdpath.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <string>
#include <thread>

#include "qisysq/FileIdentity.h"
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
        EXPECT_EQ(status.code, 0);
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
    EXPECT_EQ(get(qisysq::getSharedDir), root.locate("/usr/local/qinstal/share"));
}

TEST_F(StdpathTest, TheTextOfTheFileIsTheSharedDirectory) {
    EXPECT_EQ(sharedDirFor("/opt/shared/\n"), "/opt/shared");
}

TEST_F(StdpathTest, TrailingBlanksSlashesAndNulBytesAndLeadingBlanksAreRemoved) {
    EXPECT_EQ(sharedDirFor("/a/b//  \n"), "/a/b");
    EXPECT_EQ(sharedDirFor(" \t\r\n\v\f/a b \v\f\t/\r\n"), "/a b");
    EXPECT_EQ(sharedDirFor(std::string("/a/\0\0 \0", 7)), "/a");
}

TEST_F(StdpathTest, AnEmptyFileMeansAnEmptySharedDirectory) {
    EXPECT_EQ(sharedDirFor(""), "");
    EXPECT_EQ(sharedDirFor("/\n"), "");
}

TEST_F(StdpathTest, AFileThatCannotBeReadCountsAsMissing) {
    root.makeDirectory("/etc/qinstal/share/share.dir");
    EXPECT_EQ(get(qisysq::getSharedDir), root.locate("/usr/local/qinstal/share"));
}

TEST_F(StdpathTest, AChangeOfAnOldFileShowsAtTheNextCall) {
    EXPECT_EQ(sharedDirFor("/one"), "/one");
    struct stat info;
    ASSERT_EQ(stat(root.locate("/etc/qinstal/share/share.dir").c_str(), &info), 0);
    const qisysq::FileIdentity identity(info);
    while (!identity.isSettled(qisysq::fileTime())) {
        std::this_thread::sleep_for(std::chrono::milliseconds(20));
    }
    EXPECT_EQ(get(qisysq::getSharedDir), "/one");
    EXPECT_EQ(get(qisysq::getSharedDir), "/one") << "the kept text";
    EXPECT_EQ(sharedDirFor("/two"), "/two");
    root.remove("/etc/qinstal/share/share.dir");
    EXPECT_EQ(get(qisysq::getSharedDir), root.locate("/usr/local/qinstal/share"));
}

TEST_F(StdpathTest, TheCommonApplicationDataIsBelowTheRoot) {
    EXPECT_EQ(get(qisysq::getCommonAppDataDir), root.locate("/var/local/qinstal"));
}

TEST_F(StdpathTest, TheTemporaryDirectoryComesFromTheEnvironment) {
    setenv("TMPDIR", "/some/where", 1);
    EXPECT_EQ(get(qisysq::getTempDir), "/some/where");
    setenv("TMPDIR", "", 1);
    EXPECT_EQ(get(qisysq::getTempDir), "");
    unsetenv("TMPDIR");
    EXPECT_EQ(get(qisysq::getTempDir), "/tmp");
}

TEST_F(StdpathTest, NothingIsDoneWhenTheStatusIsNegative) {
    for (auto function : {qisysq::getSharedDir, qisysq::getCommonAppDataDir, qisysq::getTempDir}) {
        qierr::Status status;
        status.code = -1;
        qihtl::String directory;
        function(&directory, &status);
        EXPECT_EQ(status.code, -1);
        EXPECT_TRUE(directory.empty());
    }
}

}  // namespace
