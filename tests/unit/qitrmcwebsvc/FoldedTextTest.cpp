#include "qitrmcwebsvc/foldedText.h"

#include <gtest/gtest.h>

using nQITRMCWEBSVC100::equalFolded;
using nQITRMCWEBSVC100::hashFolded;

namespace {

TEST(EqualFolded, ComparesLettersWithoutCase) {
    EXPECT_TRUE(equalFolded("Mod1/CH0", "mod1/ch0"));
    EXPECT_TRUE(equalFolded("\u00c4pfel", "\u00e4PFEL"));
    EXPECT_TRUE(equalFolded("\u0394\u03a3", "\u03b4\u03c2"));  // final sigma folds to sigma
    EXPECT_FALSE(equalFolded("Mod1", "Mod2"));
}

TEST(EqualFolded, AcceptsOneLetterForSeveral) {
    EXPECT_TRUE(equalFolded("Stra\u00dfe", "STRASSE"));
    EXPECT_TRUE(equalFolded("\ufb03", "ffi"));
    EXPECT_TRUE(equalFolded("\u0390", "\u03b9\u0308\u0301"));
    EXPECT_FALSE(equalFolded("\ufb03", "ff"));
    EXPECT_FALSE(equalFolded("ff", "\ufb03"));
}

TEST(EqualFolded, ComparesAsciiLettersWithOthersThatFoldToThem) {
    EXPECT_TRUE(equalFolded("10 \u212a", "10 k"));  // the sign of kelvins folds to k
    EXPECT_TRUE(equalFolded("MA\ufb03x", "maFFIX"));
    EXPECT_FALSE(equalFolded("MA\ufb03x", "maFFIY"));
    EXPECT_FALSE(equalFolded("ma", "MA\ufb03"));
    EXPECT_FALSE(equalFolded("@[`{", "`{@["));  // the neighbours of the letters
}

TEST(EqualFolded, DoesNotFoldAccentsOrWidths) {
    EXPECT_FALSE(equalFolded("e", "\u00e9"));
    EXPECT_FALSE(equalFolded("A", "\uff21"));
    EXPECT_FALSE(equalFolded("\u00e9", "e\u0301"));
}

TEST(EqualFolded, DistinguishesAPrefixFromTheWholeText) {
    EXPECT_FALSE(equalFolded("Mod1", "Mod"));
    EXPECT_FALSE(equalFolded("", "M"));
    EXPECT_TRUE(equalFolded("", ""));
}

TEST(EqualFolded, ComparesBytesThatAreNotUtf8Unchanged) {
    EXPECT_TRUE(equalFolded("a\xff", "A\xff"));
    EXPECT_FALSE(equalFolded("a\xff", "A\xfe"));
    EXPECT_FALSE(equalFolded("\xc3", "\u00c3"));
    EXPECT_TRUE(equalFolded("\xc3X", "\xc3x"));
}

TEST(HashFolded, IsTheSameForEqualTexts) {
    EXPECT_EQ(hashFolded("Mod1/CH0"), hashFolded("mod1/ch0"));
    EXPECT_EQ(hashFolded("10 \u212a"), hashFolded("10 k"));
    EXPECT_EQ(hashFolded("MA\ufb03x"), hashFolded("maFFIX"));
    EXPECT_EQ(hashFolded("\u0390"), hashFolded("\u03b9\u0308\u0301"));
    EXPECT_EQ(hashFolded("A\xff"), hashFolded("a\xff"));
}

TEST(HashFolded, DiffersBetweenMostTexts) {
    EXPECT_NE(hashFolded("Mod1"), hashFolded("Mod2"));
    EXPECT_NE(hashFolded("Mod12"), hashFolded("Mod21"));
    EXPECT_NE(hashFolded("\u00e4"), hashFolded("\u00eb"));
    EXPECT_NE(hashFolded(""), hashFolded("M"));
}

}  // namespace
