#include "qitrmcwebsvc/requestText.h"

#include <gtest/gtest.h>

#include <cmath>
#include <cstdint>
#include <cstdlib>
#include <new>
#include <random>
#include <string>
#include <vector>

#include "qitrmcsharedcmn/Exceptions.h"
#include "qitrmcwebsvc/compactJson.h"
#include "qitrmcwebsvc/describeStatus.h"

using namespace nQITRMCWEBSVC100;

namespace {

std::string refusalOf(const std::string& body) {
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
    for (int i = 0; i < depth; ++i) {
        text += open;
    }
    for (int i = 0; i < depth; ++i) {
        text += close;
    }
    return text;
}

void expectUnchanged(const std::string& text) {
    JsonDocument document;
    parseRequestText(text, document);
    EXPECT_EQ(compactJson(document), text);
}

TEST(RequestText, ReportsWhatIsWrongAndWhere) {
    EXPECT_EQ(refusalOf(""), failure("The document is empty.", 0));
    EXPECT_EQ(refusalOf("  \n"), failure("The document is empty.", 3));
    EXPECT_EQ(refusalOf("{} x"),
              failure("The document root must not be followed by other values.", 3));
    EXPECT_EQ(refusalOf("nul"), failure("Invalid value.", 3));
    EXPECT_EQ(refusalOf("{a}"), failure("Missing a name for object member.", 1));
    EXPECT_EQ(refusalOf("{\"a\"1}"), failure("Missing a colon after a name of object member.", 4));
    EXPECT_EQ(refusalOf("{\"a\":1"), failure("Missing a comma or '}' after an object member.", 6));
    EXPECT_EQ(refusalOf("[1 2]"), failure("Missing a comma or ']' after an array element.", 3));
    EXPECT_EQ(refusalOf("[\"\\u00g0\"]"),
              failure("Incorrect hex digit after \\u escape in string.", 2));
    EXPECT_EQ(refusalOf("[\"\\ud800x\"]"), failure("The surrogate pair in string is invalid.", 2));
    EXPECT_EQ(refusalOf("[\"\\x\"]"), failure("Invalid escape character in string.", 2));
    EXPECT_EQ(refusalOf("[\"abc"), failure("Missing a closing quotation mark in string.", 5));
    EXPECT_EQ(refusalOf("[1.]"), failure("Miss fraction part in number.", 3));
    EXPECT_EQ(refusalOf("[1e]"), failure("Miss exponent in number.", 3));
    EXPECT_EQ(refusalOf("[1e309]"), failure("Number too big to be stored in double.", 1));
}

TEST(RequestText, CountsOffsetsInTheBodyAsItWasSent) {
    EXPECT_EQ(refusalOf("[\"\\u0041\\n\\ud83d\\ude00\",x]"), failure("Invalid value.", 24));
    EXPECT_EQ(refusalOf("[\"\\u0041\\n\\q\"]"), failure("Invalid escape character in string.", 10));
    EXPECT_EQ(refusalOf("{\"\\u0061\":\"\\n"),
              failure("Missing a closing quotation mark in string.", 13));
    EXPECT_EQ(refusalOf("[\"\\u0041\",10e308]"),
              failure("Number too big to be stored in double.", 10));
}

TEST(RequestText, ReadsTextsAndNamesWithTheirEscapes) {
    std::string body =
        "{\"\\u0061b\":\"\\\"\\\\\\/\\b\\f\\n\\r\\t\", \"\":\"\",\"n\":\"x\\u0000y\","
        "\"\\ud83d\\ude00\":[\"\\u00e9\",-0.5,\"\\u20ac\"],\"long\":\"" +
        std::string(10000, 'x') + "\\n\"}";
    JsonDocument document;
    parseRequestText(body, document);
    body.assign(body.size(), '?');
    const auto textOf = [](const JsonValue& value) {
        return std::string(value.GetString(), value.GetStringLength());
    };
    EXPECT_EQ(textOf(document["ab"]), "\"\\/\b\f\n\r\t");
    EXPECT_EQ(textOf(document[""]), "");
    EXPECT_EQ(textOf(document["n"]), std::string("x\0y", 3));
    EXPECT_EQ(textOf(document["\U0001f600"][0]), "\u00e9");
    EXPECT_EQ(document["\U0001f600"][1].GetDouble(), -0.5);
    EXPECT_EQ(textOf(document["\U0001f600"][2]), "\u20ac");
    EXPECT_EQ(textOf(document["long"]), std::string(10000, 'x') + "\n");
}

TEST(RequestText, EndsAtTheFirstNul) {
    EXPECT_EQ(refusalOf(std::string("{}\0garbage", 10)), "parsed");
    EXPECT_EQ(refusalOf(std::string("{\0}", 3)), failure("Missing a name for object member.", 1));
    // Far behind the end, where no memory of the request is.
    const std::string behind(1'000'000, 'x');
    EXPECT_EQ(refusalOf("[1e-99999999999" + std::string(1, '\0') + behind),
              failure("Missing a comma or ']' after an array element.", 15));
}

TEST(RequestText, AcceptsBlanksAroundAnyRoot) {
    for (const char* body : {" {} ", "\t[]\r\n", "null", "1", "\"\""}) {
        EXPECT_EQ(refusalOf(body), "parsed") << body;
    }
}

TEST(RequestText, RefusesNumbersTooBigForADoubleInEveryForm) {
    EXPECT_EQ(refusalOf("[10e308]"), failure("Number too big to be stored in double.", 1));
    EXPECT_EQ(refusalOf("[-10e308]"), failure("Number too big to be stored in double.", 1));
    EXPECT_EQ(refusalOf("[1e308]"), "parsed");
}

TEST(RequestText, ReadsANumberWithAnExponentFarBelowZeroAsZero) {
    JsonDocument document;
    parseRequestText("[0.0000000001e-2147483639,-1e-99999999999]", document);
    EXPECT_EQ(document[0].GetDouble(), 0.0);
    EXPECT_EQ(document[1].GetDouble(), 0.0);
}

// ---- Doubles ------------------------------------------------------------------------------------

double doubleOf(const std::string& literal) {
    JsonDocument document;
    parseRequestText("[" + literal + " ]", document);
    EXPECT_TRUE(document[0].IsDouble()) << literal.substr(0, 40);
    return document[0].GetDouble();
}

// A number of 17 digits, the first not 0, with its point anywhere or an exponent.
std::string randomLiteral(std::mt19937_64& random) {
    std::string digits = std::to_string(10000000000000000 + random() % 90000000000000000);
    const std::string sign = random() % 2 == 0 ? "-" : "";
    if (random() % 2 == 0) {
        return sign + digits.insert(1 + random() % 16, ".");
    }
    const int exponent = static_cast<int>(random() % 632) - 324;
    return sign + digits.insert(1, ".") + "e" + std::to_string(exponent);
}

TEST(RequestText, ALiteralOf17DigitsIsNotOneUnitOff) {
    std::mt19937_64 random(17);
    std::vector<std::string> literals;
    std::string body;
    for (int i = 0; i < 100000; ++i) {
        literals.push_back(randomLiteral(random));
        body += (i == 0 ? "[" : ",") + literals.back();
    }
    JsonDocument document;
    parseRequestText(body + "]", document);
    int wrong = 0;
    for (rapidjson::SizeType i = 0; i < document.Size(); ++i) {
        wrong += document[i].GetDouble() != std::strtod(literals[i].c_str(), nullptr);
    }
    EXPECT_EQ(document.Size(), 100000u);
    EXPECT_EQ(wrong, 0);
}

TEST(RequestText, ALiteralBetweenTwoDoublesGoesToTheNearerAndFromTheMiddleToTheEvenOne) {
    EXPECT_EQ(doubleOf("9007199254740993.0"), 9007199254740992.0);
    EXPECT_EQ(doubleOf("9007199254740993." + std::string(800, '0') + "1"), 9007199254740994.0);
    EXPECT_EQ(doubleOf("9007199254740995.0"), 9007199254740996.0);
    EXPECT_EQ(doubleOf("184467440737095516159999.5"), 0x1.388p+77);
    EXPECT_EQ(doubleOf("5e-324"), 0x1p-1074);
    EXPECT_EQ(doubleOf("2.4703282292062328e-324"), 0x1p-1074);
    EXPECT_EQ(doubleOf("2.4703282292062327e-324"), 0.0);
    EXPECT_EQ(doubleOf("1.7976931348623157e+308"), 0x1.fffffffffffffp+1023);
}

TEST(RequestText, ALiteralTooSmallForADoubleIsAZeroOfItsSign) {
    for (const std::string& literal :
         {std::string("1e-400"), "0." + std::string(400, '0') + "1",
          "0." + std::string(30, '0') + "1e-320", "0." + std::string(1000000, '0') + "1"}) {
        EXPECT_EQ(doubleOf(literal), 0.0);
        EXPECT_FALSE(std::signbit(doubleOf(literal)));
        EXPECT_TRUE(std::signbit(doubleOf("-" + literal)));
    }
    EXPECT_TRUE(std::signbit(doubleOf("-0.0")));
}

TEST(RequestText, ALiteralOfAMillionDigitsIsReadInOneGo) {
    EXPECT_EQ(doubleOf("0." + std::string(1000000, '9')), 1.0);
    EXPECT_EQ(doubleOf("1." + std::string(1000000, '0') + "1"), 1.0);
    EXPECT_EQ(doubleOf("0." + std::string(1000000, '0') + "25e1000000"), 0.25);
}

TEST(RequestText, AnUncountableNumberOfDigitsIsNoMemoryInsteadOfACrash) {
    const std::string body = "[0." + std::string(300000000, '0') + "e2147483650]";
    JsonDocument document;
    EXPECT_THROW(parseRequestText(body, document), std::bad_alloc);
}

TEST(RequestText, ReadsLongArraysLikeShortOnes) {
    std::string bytes;
    std::string mixed;
    for (int i = 0; i < 5000; ++i) {
        bytes += (i == 0 ? "" : ",") + std::to_string(i % 256);
        mixed += "-1,0.5,null,true,false,4294967296,-4294967296,18446744073709551615,";
    }
    mixed += "7";
    for (const std::string& elements : {bytes, mixed}) {
        const std::string array = "[" + elements + "]";
        expectUnchanged(array);
        expectUnchanged("{\"a\":" + array + ",\"b\":\"text\",\"c\":[]}");
        expectUnchanged("[1,[" + array + ",2," + array + "],[" + elements + ",[3]]]");
        expectUnchanged("[" + elements + ",\"a]\"," + elements + "]");
        expectUnchanged("[" + elements + ",{\"a\":" + array + "}]");
        for (const int depth : {7, 8, 9, 999}) {
            expectUnchanged(std::string(depth, '[') + array + std::string(depth, ']'));
        }
    }
}

TEST(RequestText, ReportsWhatIsWrongInALongArray) {
    std::string array = "[1";
    for (int i = 0; i < 4000; ++i) {
        array += ",1";
    }
    EXPECT_EQ(refusalOf(array), failure("Missing a comma or ']' after an array element.", 8002));
    EXPECT_EQ(refusalOf(array + ",]"), failure("Invalid value.", 8003));
    EXPECT_EQ(refusalOf(array + " 1]"),
              failure("Missing a comma or ']' after an array element.", 8003));
    EXPECT_EQ(refusalOf(array + ",nul]"), failure("Invalid value.", 8006));
    EXPECT_EQ(refusalOf(array + ",1e999]"),
              failure("Number too big to be stored in double.", 8003));
    EXPECT_EQ(refusalOf(array + "}"),
              failure("Missing a comma or ']' after an array element.", 8002));
    EXPECT_EQ(refusalOf("[" + std::string(8000, ',') + "]"), failure("Invalid value.", 1));
    EXPECT_EQ(refusalOf(array + "]]"),
              failure("The document root must not be followed by other values.", 8003));
    EXPECT_EQ(refusalOf(array + std::string(1, '\0') + "]"),
              failure("Missing a comma or ']' after an array element.", 8002));
}

TEST(RequestText, RefusesNestingBeyondTheLimit) {
    const std::string deepest = nested("[", maxNesting, "]");
    EXPECT_EQ(refusalOf(deepest), "parsed");
    EXPECT_EQ(refusalOf("[" + deepest + "]"),
              failure("Terminate parsing due to Handler error.", maxNesting + 1));
    EXPECT_EQ(refusalOf(std::string(200000, '[')),
              failure("Terminate parsing due to Handler error.", maxNesting + 1));
    EXPECT_EQ(refusalOf("{\"a\":" + deepest + "}"),
              failure("Terminate parsing due to Handler error.", 5 + maxNesting));
}

TEST(RequestText, CountsLevelsOfNestingAndNotContainers) {
    std::string manyFlatOnes = "[";
    for (int i = 0; i < 2 * maxNesting; ++i) {
        manyFlatOnes += "[{}],";
    }
    EXPECT_EQ(refusalOf(manyFlatOnes + "1]"), "parsed");
}

}  // namespace
