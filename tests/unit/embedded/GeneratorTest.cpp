#include <gtest/gtest.h>

#include <string>

#include "embedded/EmbeddedFiles.h"

namespace {

const EmbeddedFile& fileAt(int index) {
    return embeddedFiles().begin()[index];
}

TEST(EmbeddingGenerator, KeepsEveryByteOfAFile) {
    // The fixture, written out: among others a NUL before a digit and a would-be trigraph.
    const char expected[] =
        "quote \" backslash \\ trigraph ?\?= percent %s\r\n"
        "nul \0"
        "7 digit after, escape \x1b"
        "1, tab\t\n"
        "\xe3\x81\x82\xff\x7f\n"
        "\rlast line without an end";
    const EmbeddedFile& file = fileAt(0);
    EXPECT_EQ(std::string(expected, sizeof(expected) - 1), std::string(file.data, file.size));
}

TEST(EmbeddingGenerator, NamesAFileWithoutItsFolder) {
    EXPECT_STREQ("awkward.bin", fileAt(0).name);
    EXPECT_STREQ("empty.txt", fileAt(1).name);
}

TEST(EmbeddingGenerator, KeepsTheOrderGiven) {
    EXPECT_EQ(2, embeddedFiles().end() - embeddedFiles().begin());
}

TEST(EmbeddingGenerator, EmbedsAnEmptyFile) {
    EXPECT_EQ(0u, fileAt(1).size);
    EXPECT_STREQ("", fileAt(1).data);
}

TEST(EmbeddingGenerator, PutsANulBehindEachFile) {
    for (const EmbeddedFile& file : embeddedFiles())
        EXPECT_EQ('\0', file.data[file.size]) << file.name;
}

}  // namespace
