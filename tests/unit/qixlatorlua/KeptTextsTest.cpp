#include "qixlatorlua/KeptTexts.h"

#include <gtest/gtest.h>

#include <string>

#include "support/TestRoot.h"

namespace {

using qisysq::FileLooks;
using qixlatorlua::KeptTexts;

void look(const std::string& path) {
    qisysq::FileIdentity identity;
    qisysq::lookAtFile(path.c_str(), &identity);
}

// Texts that depend on one file that exists and one that does not.
class KeptTextsTest : public testing::Test {
  protected:
    KeptTextsTest() { root.write("/present", "1"); }

    void add(std::int32_t code, std::uint32_t attributes, const std::string& text) {
        const FileLooks looks;
        look(root.locate("/present"));
        look(root.locate("/absent"));
        texts.add(code, attributes, *FileLooks::current(), text.c_str());
    }

    std::string find(std::int32_t code, std::uint32_t attributes = 0) const {
        const char* text = texts.find(code, attributes);
        return text == nullptr ? "none" : text;
    }

    TestRoot root;
    KeptTexts texts;
};

TEST_F(KeptTextsTest, ATextIsFoundByItsCodeAndAttributes) {
    EXPECT_EQ(find(-1), "none");
    add(-1, 0, "one");
    add(-2, 0, "two");
    add(-1, 1, "eins");
    EXPECT_EQ(find(-1), "one");
    EXPECT_EQ(find(-2), "two");
    EXPECT_EQ(find(-1, 1), "eins");
    EXPECT_EQ(find(-2, 1), "none");
}

TEST_F(KeptTextsTest, ATextIsNotFoundOnceAFileHasChanged) {
    add(-1, 0, "one");
    root.write("/present", "12");
    EXPECT_EQ(find(-1), "none");
    add(-1, 0, "another");
    EXPECT_EQ(find(-1), "another");
}

TEST_F(KeptTextsTest, ATextIsNotFoundOnceAFileWasAdded) {
    add(-1, 0, "one");
    root.write("/absent", "");
    EXPECT_EQ(find(-1), "none");
}

TEST_F(KeptTextsTest, TheOldestTextIsReplaced) {
    for (int code = 1; code <= 5; ++code) {
        add(code, 0, std::to_string(code));
    }
    EXPECT_EQ(find(1), "none");
    for (int code = 2; code <= 5; ++code) {
        EXPECT_EQ(find(code), std::to_string(code));
    }
}

TEST_F(KeptTextsTest, ATextThatDependsOnMoreThanLooksIsNotKept) {
    const FileLooks looks;
    look(root.locate("/present"));
    FileLooks::setIncomplete();
    texts.add(-1, 0, *FileLooks::current(), "one");
    EXPECT_EQ(find(-1), "none");
}

TEST_F(KeptTextsTest, ATextThatDependsOnManyFilesIsNotKept) {
    const FileLooks looks;
    for (int number = 0; number < 40; ++number) {
        look(root.locate("/file" + std::to_string(number)));
    }
    texts.add(-1, 0, *FileLooks::current(), "one");
    EXPECT_EQ(find(-1), "none");
}

TEST_F(KeptTextsTest, ALongTextIsNotKept) {
    add(-1, 0, std::string(511, 'x'));
    add(-2, 0, std::string(512, 'x'));
    EXPECT_EQ(find(-1), std::string(511, 'x'));
    EXPECT_EQ(find(-2), "none");
}

}  // namespace
