#include "qitrmcwebsvc/requestText.h"

#include <gtest/gtest.h>

#include <string>

#include "qitrmcsharedcmn/Exceptions.h"
#include "qitrmcwebsvc/describeStatus.h"

using namespace nQITRMCWEBSVC100;

namespace {

std::string failureOf(const std::string& body) {
    JsonDocument document;
    try {
        parseRequestText(body, document);
    } catch (const nQITRMCSHAREDCMN100::BasicError& error) {
        return describeStatus(*error.status());
    }
    return "parsed";
}

std::string failure(const std::string& text, int offset) {
    return "-32700 kUsageTypeDetails=" + text + " kUsageTypeOffset=" + std::to_string(offset);
}

std::string nested(const std::string& open, int depth, const std::string& close) {
    std::string text;
    for (int i = 0; i < depth; ++i)
        text += open;
    for (int i = 0; i < depth; ++i)
        text += close;
    return text;
}

TEST(RequestText, TellsWhatIsWrongAndWhere) {
    EXPECT_EQ(failureOf(""), failure("The document is empty.", 0));
    EXPECT_EQ(failureOf("  \n"), failure("The document is empty.", 3));
    EXPECT_EQ(failureOf("{} x"),
              failure("The document root must not be followed by other values.", 3));
    EXPECT_EQ(failureOf("nul"), failure("Invalid value.", 3));
    EXPECT_EQ(failureOf("{a}"), failure("Missing a name for object member.", 1));
    EXPECT_EQ(failureOf("{\"a\"1}"), failure("Missing a colon after a name of object member.", 4));
    EXPECT_EQ(failureOf("{\"a\":1"), failure("Missing a comma or '}' after an object member.", 6));
    EXPECT_EQ(failureOf("[1 2]"), failure("Missing a comma or ']' after an array element.", 3));
    EXPECT_EQ(failureOf("[\"\\u00g0\"]"),
              failure("Incorrect hex digit after \\u escape in string.", 2));
    EXPECT_EQ(failureOf("[\"\\ud800x\"]"), failure("The surrogate pair in string is invalid.", 2));
    EXPECT_EQ(failureOf("[\"\\x\"]"), failure("Invalid escape character in string.", 2));
    EXPECT_EQ(failureOf("[\"abc"), failure("Missing a closing quotation mark in string.", 5));
    EXPECT_EQ(failureOf("[1.]"), failure("Miss fraction part in number.", 3));
    EXPECT_EQ(failureOf("[1e]"), failure("Miss exponent in number.", 3));
    EXPECT_EQ(failureOf("[1e309]"), failure("Number too big to be stored in double.", 1));
}

TEST(RequestText, EndsAtTheFirstNul) {
    EXPECT_EQ(failureOf(std::string("{}\0garbage", 10)), "parsed");
    EXPECT_EQ(failureOf(std::string("{\0}", 3)), failure("Missing a name for object member.", 1));
}

TEST(RequestText, AcceptsBlanksAroundAnyRoot) {
    for (const char* body : {" {} ", "\t[]\r\n", "null", "1", "\"\""})
        EXPECT_EQ(failureOf(body), "parsed") << body;
}

TEST(RequestText, RefusesNumbersTooBigForADoubleInEveryForm) {
    EXPECT_EQ(failureOf("[10e308]"), failure("Number too big to be stored in double.", 1));
    EXPECT_EQ(failureOf("[-10e308]"), failure("Number too big to be stored in double.", 1));
    EXPECT_EQ(failureOf("[1e308]"), "parsed");
}

TEST(RequestText, TakesAnExponentFarBelowZeroAsZero) {
    JsonDocument document;
    parseRequestText("[0.0000000001e-2147483639,-1e-99999999999]", document);
    EXPECT_EQ(document[0].GetDouble(), 0.0);
    EXPECT_EQ(document[1].GetDouble(), 0.0);
}

TEST(RequestText, RefusesNestingBeyondTheLimit) {
    const std::string deepest = nested("[", maxNesting, "]");
    EXPECT_EQ(failureOf(deepest), "parsed");
    EXPECT_EQ(failureOf("[" + deepest + "]"),
              failure("Terminate parsing due to Handler error.", maxNesting + 1));
    EXPECT_EQ(failureOf(std::string(200000, '[')),
              failure("Terminate parsing due to Handler error.", maxNesting + 1));
    EXPECT_EQ(failureOf("{\"a\":" + deepest + "}"),
              failure("Terminate parsing due to Handler error.", 5 + maxNesting));
}

TEST(RequestText, CountsNestingAndNotContainers) {
    std::string manyFlatOnes = "[";
    for (int i = 0; i < 2 * maxNesting; ++i)
        manyFlatOnes += "[{}],";
    EXPECT_EQ(failureOf(manyFlatOnes + "1]"), "parsed");
}

}  // namespace
