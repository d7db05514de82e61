#include "Reading.h"
#include "support/CommaLocale.h"

namespace {

constexpr std::int32_t lowest = -2147483647 - 1;
constexpr std::int32_t highest = 2147483647;

}  // namespace

TEST(JsonzGetInt, ReadsWholeNumbers) {
    EXPECT_EQ(jsonz_getInt("0", 7), 0);
    EXPECT_EQ(jsonz_getInt(" -250828", 7), -250828);
    EXPECT_EQ(jsonz_getInt("2147483647", 7), highest);
    EXPECT_EQ(jsonz_getInt("-2147483648", 7), lowest);
}

TEST(JsonzGetInt, TruncatesFractions) {
    EXPECT_EQ(jsonz_getInt("1.9", 7), 1);
    EXPECT_EQ(jsonz_getInt("-1.9", 7), -1);
    EXPECT_EQ(jsonz_getInt("1.", 7), 1);
    EXPECT_EQ(jsonz_getInt("1.25e2", 7), 125);
    EXPECT_EQ(jsonz_getInt("1e+", 7), 1);
}

TEST(JsonzGetInt, ReadsALeadingZeroAsOctal) {
    EXPECT_EQ(jsonz_getInt("010", 7), 8);
    EXPECT_EQ(jsonz_getInt("08", 7), 0);
}

TEST(JsonzGetInt, ReturnsTheDefaultForEverythingElse) {
    for (const char* text : {"\"1\"", "true", "null", "[1]", "{}", "x", "", "-", "-.", "1e"}) {
        SCOPED_TRACE(text);
        EXPECT_EQ(jsonz_getInt(text, 7), 7);
    }
    EXPECT_EQ(jsonz_getInt(nullptr, 7), 7);
}

TEST(JsonzGetInt, SaturatesOutOfRange) {
    EXPECT_EQ(jsonz_getInt("2147483648", 7), highest);
    EXPECT_EQ(jsonz_getInt("-99999999999999999999999", 7), lowest);
    EXPECT_EQ(jsonz_getInt("1e99", 7), highest);
    EXPECT_EQ(jsonz_getInt("-1e999999999", 7), lowest);
    EXPECT_EQ(jsonz_getInt("1e-999999999", 7), 0);
}

TEST(JsonzGetInt, ReturnsTheEndOfTheValue) {
    const char* end = nullptr;
    const char* text = " 12,";
    EXPECT_EQ(jsonz_getInt(text, 7, &end), 12);
    EXPECT_EQ(end, text + 3);
    const char* string = "\"1\",";
    EXPECT_EQ(jsonz_getInt(string, 7, &end), 7);
    EXPECT_EQ(end, string + 3);
    EXPECT_EQ(jsonz_getInt("x", 7, &end), 7);
    EXPECT_EQ(end, nullptr);
}

TEST(JsonzGetInt, ReadsFractionsUnderALocaleWithADecimalComma) {
    const CommaLocale locale;
    EXPECT_EQ(jsonz_getInt("1.9e1", 7), 19);
    EXPECT_EQ(jsonz_getInt("-12.5", 7), -12);
    EXPECT_EQ(jsonz_getInt("1.25e2,3", 7), 125);
}
