#include "Reading.h"

using jsonz_test::expectFault;
using jsonz_test::Reading;

TEST(JsonzScalar, NullPositionFailsWithValueExpected) {
    jsonz_value value;
    EXPECT_EQ(jsonz_readValue(nullptr, &value), nullptr);
    EXPECT_EQ(value.type, jsonz_typeFailure);
    EXPECT_EQ(value.position, nullptr);
    EXPECT_EQ(value.error, 1);
}

TEST(JsonzScalar, RecordMayBeLeftOut) {
    const char* text = "17 ";
    EXPECT_EQ(jsonz_readValue(text, nullptr), text + 2);
    EXPECT_EQ(jsonz_readValue("x", nullptr), nullptr);
    EXPECT_EQ(jsonz_readValue(nullptr, nullptr), nullptr);
}

TEST(JsonzScalar, ReadsKeywordsByTheirOwnLength) {
    EXPECT_EQ(Reading("null").value.type, 1);
    EXPECT_EQ(Reading("nullx").consumed, 4);
    const Reading yes("true");
    EXPECT_EQ(yes.value.type, 2);
    EXPECT_TRUE(yes.value.boolValue);
    const Reading no("falsely");
    EXPECT_EQ(no.value.type, 2);
    EXPECT_FALSE(no.value.boolValue);
    EXPECT_EQ(no.consumed, 5);
    expectFault("nul", 0, 2);
    expectFault("True", 0, 2);
}

TEST(JsonzScalar, SkipsLeadingWhiteSpace) {
    EXPECT_EQ(Reading(" \t\r\n7").consumed, 5);
    expectFault("\v7", 0, 2);
    expectFault("  ", 2, 2);
    expectFault("", 0, 2);
}

TEST(JsonzScalar, ReadsStringsWithEscapesLeftInPlace) {
    const Reading reading("\"a\\n\\u00e9\\\"\x7f\xc3\xa9\" rest");
    EXPECT_EQ(reading.value.type, 4);
    EXPECT_EQ(reading.valueText(), "a\\n\\u00e9\\\"\x7f\xc3\xa9");
    EXPECT_EQ(reading.offset(reading.value.text), 1);
    EXPECT_EQ(reading.consumed, 16);
    EXPECT_EQ(Reading("\"\"").value.length, 0u);
}

TEST(JsonzScalar, AcceptsEachKnownEscape) {
    EXPECT_EQ(Reading(R"("\"\/\\\b\f\n\r\t\u00fF")").value.type, 4);
}

TEST(JsonzScalar, RefusesControlCharactersInStrings) {
    expectFault("\"a\nb\"", 2, 2);
    expectFault("\"\x1f\"", 1, 2);
    expectFault("\"abc", 4, 2);
    EXPECT_EQ(Reading("\"a\\nb\"").value.type, 4);
}

TEST(JsonzScalar, RefusesOtherEscapes) {
    expectFault("\"\\x\"", 2, 7);
    expectFault("\"\\N\"", 2, 7);
    expectFault("\"\\u12g4\"", 5, 7);
    expectFault("\"\\u12", 5, 7);
    expectFault("\"\\", 2, 7);
}

TEST(JsonzScalar, ReadsNumbersMoreLooselyThanTheGrammar) {
    for (const char* text : {"-", "01", "0", "-12", "99999999999999999999"}) {
        SCOPED_TRACE(text);
        const Reading reading(text);
        EXPECT_EQ(reading.value.type, 3);
        EXPECT_FALSE(reading.value.isReal);
        EXPECT_EQ(reading.valueText(), text);
    }
    for (const char* text : {"1.", "1.5", "-.5", "1e5", "1E-5", "1e+", "1.e-"}) {
        SCOPED_TRACE(text);
        const Reading reading(text);
        EXPECT_EQ(reading.value.type, 3);
        EXPECT_TRUE(reading.value.isReal);
        EXPECT_EQ(reading.valueText(), text);
    }
    EXPECT_EQ(Reading("1.2.3").consumed, 3);
    EXPECT_EQ(Reading("1-2").consumed, 1);
    expectFault("+1", 0, 2);
    expectFault(".5", 0, 2);
}

TEST(JsonzScalar, RefusesAnEmptyExponentWithoutAnErrorNumber) {
    expectFault("1e", 2, 0);
    expectFault("-1.5Ex", 5, 0);
}

TEST(JsonzScalar, NamesErrors) {
    EXPECT_STREQ(jsonz_errorName(0), "unknown");
    EXPECT_STREQ(jsonz_errorName(1), "jsonz_errorValueExpected");
    EXPECT_STREQ(jsonz_errorName(2), "jsonz_errorDoubleQuoteExpected");
    EXPECT_STREQ(jsonz_errorName(3), "jsonz_errorCurlyBracketExpected");
    EXPECT_STREQ(jsonz_errorName(4), "jsonz_errorSquareBracketExpected");
    EXPECT_STREQ(jsonz_errorName(5), "jsonz_errorColonExpected");
    EXPECT_STREQ(jsonz_errorName(6), "jsonz_errorCommaExpected");
    EXPECT_STREQ(jsonz_errorName(7), "jsonz_errorInvalidStringSequence");
    EXPECT_STREQ(jsonz_errorName(8), "jsonz_errorTrailingComma");
    EXPECT_STREQ(jsonz_errorName(9), "jsonz_errorTrailingChar");
    EXPECT_STREQ(jsonz_errorName(10), "unknown");
    EXPECT_STREQ(jsonz_errorName(-1), "unknown");
}
