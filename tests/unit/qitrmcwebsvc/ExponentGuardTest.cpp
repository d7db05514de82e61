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
    const std::string digits(200000001, '7');
    EXPECT_TRUE(holdsUncountableNumber("[" + digits));
    EXPECT_FALSE(holdsUncountableNumber("[\"" + digits + "\"]"));
    EXPECT_FALSE(holdsUncountableNumber(digits.substr(1) + "." + digits.substr(1)));
}

}  // namespace
