#include <gtest/gtest.h>

#include <string>

#include "embedded/EmbeddedFiles.h"

namespace {

const EmbeddedFile& fileAt(int index) {
    return embeddedFiles().begin()[index];
}

TEST(EmbeddingGenerator, KeepsEveryByteOfAFile) {
    // The content of the fixture; it includes a NUL before a digit and what looks like a trigraph.
    const char expected[] =
        "quote \" backslash \\ trigraph ?\?= percent %s\r\n"
        "nul \0"
        "7 digit after, escape \x1b"
        "1, tab\t\n"
        "\xe3\x81\x82\xff\x7f\n"
        "\rlast line without an end";
    const EmbeddedFile& file = fileAt(0);
    EXPECT_EQ(std::string(file.data, file.size), std::string(expected, sizeof(expected) - 1));
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
    for (const EmbeddedFile& file : embeddedFiles())
        EXPECT_EQ(file.data[file.size], '\0') << file.name;
}

}  // namespace
