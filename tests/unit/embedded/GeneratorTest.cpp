#include <gtest/gtest.h>

#include <string_view>

#include "FixtureConstants.h"
#include "embedded/EmbeddedFiles.h"

namespace {

const EmbeddedFile& fileAt(int index) {
    return embeddedFiles().begin()[index];
}

// The content of the fixture; it includes a NUL before a digit and what looks like a trigraph.
constexpr char awkward[] =
    "quote \" backslash \\ trigraph ?\?= percent %s\r\n"
    "nul \0"
    "7 digit after, escape \x1b"
    "1, tab\t\n"
    "\xe3\x81\x82\xff\x7f\n"
    "\rlast line without an end";
constexpr std::string_view expected(awkward, sizeof(awkward) - 1);

TEST(EmbeddingGenerator, KeepsEveryByteOfAFile) {
    const EmbeddedFile& file = fileAt(0);
    EXPECT_EQ(std::string_view(file.data, file.size), expected);
}

TEST(EmbeddingGenerator, KeepsEveryByteInAConstant) {
    EXPECT_EQ(embedded::awkward, expected);
    EXPECT_EQ(embedded::empty, "");
}

TEST(EmbeddingGenerator, NamesAFileWithoutItsFolder) {
    EXPECT_STREQ(fileAt(0).name, "awkward.bin");
    EXPECT_STREQ(fileAt(1).name, "empty.txt");
}

TEST(EmbeddingGenerator, KeepsTheOrderGiven) {
    EXPECT_EQ(embeddedFiles().end() - embeddedFiles().begin(), 2);
}

TEST(EmbeddingGenerator, EmbedsAnEmptyFile) {
    EXPECT_EQ(fileAt(1).size, 0u);
    EXPECT_STREQ(fileAt(1).data, "");
}

TEST(EmbeddingGenerator, PutsANulAfterEachFile) {
    for (const EmbeddedFile& file : embeddedFiles()) {
        EXPECT_EQ(file.data[file.size], '\0') << file.name;
    }
}

}  // namespace
