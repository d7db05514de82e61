#include "qisysq/FileLooks.h"

#include <gtest/gtest.h>

#include <string>

#include "support/TestRoot.h"

namespace {

using qisysq::FileIdentity;
using qisysq::FileLooks;
using qisysq::lookAtFile;

off_t sizeOf(const std::string& path) {
    FileIdentity identity;
    return lookAtFile(path.c_str(), &identity) ? identity.size : -1;
}

}  // namespace

TEST(FileLooks, WithoutOneEveryChangeShows) {
    const TestRoot root;
    EXPECT_EQ(sizeOf(root.locate("/file")), -1);
    root.write("/file", "12");
    EXPECT_EQ(sizeOf(root.locate("/file")), 2);
    root.write("/file", "123");
    EXPECT_EQ(sizeOf(root.locate("/file")), 3);
}

TEST(FileLooks, RepeatTheFirstAnswerWhileTheyExist) {
    const TestRoot root;
    root.write("/present", "12");
    {
        const FileLooks looks;
        EXPECT_EQ(sizeOf(root.locate("/present")), 2);
        EXPECT_EQ(sizeOf(root.locate("/absent")), -1);
        root.write("/present", "123");
        root.write("/absent", "1");
        EXPECT_EQ(sizeOf(root.locate("/present")), 2);
        EXPECT_EQ(sizeOf(root.locate("/absent")), -1);
    }
    EXPECT_EQ(sizeOf(root.locate("/present")), 3);
    EXPECT_EQ(sizeOf(root.locate("/absent")), 1);
}

TEST(FileLooks, DoNotConfusePathsOfTheSameLength) {
    const TestRoot root;
    root.write("/a", "1");
    root.write("/b", "12");
    const FileLooks looks;
    EXPECT_EQ(sizeOf(root.locate("/a")), 1);
    EXPECT_EQ(sizeOf(root.locate("/b")), 2);
}

TEST(FileLooks, LookAgainAtFilesForWhichThereIsNoRoom) {
    const TestRoot root;
    const FileLooks looks;
    for (int number = 0; number < 40; ++number) {
        const std::string name = "/file" + std::to_string(number);
        root.write(name, "1");
        EXPECT_EQ(sizeOf(root.locate(name)), 1);
    }
    root.write("/file0", "12");
    root.write("/file39", "12");
    EXPECT_EQ(sizeOf(root.locate("/file0")), 1);
    EXPECT_EQ(sizeOf(root.locate("/file39")), 2);
}

TEST(FileLooks, AnInnerOneLooksForItself) {
    const TestRoot root;
    root.write("/file", "1");
    const FileLooks outer;
    EXPECT_EQ(sizeOf(root.locate("/file")), 1);
    root.write("/file", "12");
    {
        const FileLooks inner;
        EXPECT_EQ(sizeOf(root.locate("/file")), 2);
    }
    EXPECT_EQ(sizeOf(root.locate("/file")), 1);
}
