#include "qitrmcwebsvc/exponentGuard.h"

#include <gtest/gtest.h>

#include <string>

using nQITRMCWEBSVC100::holdsUncountableNumber;
using nQITRMCWEBSVC100::withSafeExponents;

namespace {

std::string guarded(const std::string& text) {
    return withSafeExponents(text.c_str()).value_or(text);
}

TEST(ExponentGuard, LeavesATextWithoutLongExponentsUntouched) {
    EXPECT_FALSE(withSafeExponents("{\"a\":1e-300,\"b\":-1.5E-308,\"c\":[]}"));
    EXPECT_FALSE(withSafeExponents(""));
    EXPECT_FALSE(withSafeExponents("-"));
    EXPECT_FALSE(withSafeExponents("e-"));
}

TEST(ExponentGuard, LowersAnExponentOfTenDigitsOrMoreAndKeepsItsLength) {
    EXPECT_EQ(guarded("0.0000000001e-2147483639"), "0.0000000001e-0999999999");
    EXPECT_EQ(guarded("[1E-99999999999999,2]"), "[1E-00000999999999,2]");
}

TEST(ExponentGuard, DoesNotCountLeadingZeros) {
    EXPECT_FALSE(withSafeExponents("5e-00000000000000000002"));
    EXPECT_EQ(guarded("5e-0001234567890"), "5e-0000999999999");
}

TEST(ExponentGuard, KeepsNineDigits) {
    EXPECT_FALSE(withSafeExponents("1e-123456789"));
}

TEST(ExponentGuard, DoesNotChangeStringsWithEscapes) {
    const std::string text = R"({"e-9999999999":"\"e-9999999999\\","n":1e-9999999999})";
    EXPECT_EQ(guarded(text), R"({"e-9999999999":"\"e-9999999999\\","n":1e-0999999999})");
}

TEST(ExponentGuard, StopsAtAnUnfinishedString) {
    EXPECT_EQ(guarded("1e-9999999999 \"e-9999999999\\"), "1e-0999999999 \"e-9999999999\\");
}

TEST(ExponentGuard, CountsDigitsOutsideStringsOnly) {
    // In place, since a copy of so much takes longer than what is tested.
    std::string text(200000003, '7');
    text.front() = text.back() = '"';
    EXPECT_FALSE(holdsUncountableNumber(text));
    text.front() = text.back() = ' ';
    EXPECT_TRUE(holdsUncountableNumber(text));
    text[1] = '.';
    EXPECT_FALSE(holdsUncountableNumber(text)) << "200 million digits";
    text[1] = '7';
    text[text.size() - 2] = '.';
    EXPECT_FALSE(holdsUncountableNumber(text)) << "200 million digits before the point";
}

}  // namespace
