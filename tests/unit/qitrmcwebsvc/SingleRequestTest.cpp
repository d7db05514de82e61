#include "qitrmcwebsvc/SingleRequest.h"

#include <gtest/gtest.h>

#include <string>

#include "requests.h"

namespace nQITRMCWEBSVC100 {
namespace {

std::string textOf(const JsonValue& value) {
    JsonBuffer buffer;
    JsonWriter writer(buffer);
    value.Accept(writer);
    return {buffer.GetString(), buffer.GetSize()};
}

// Also expects a refused value to be unchanged, and an accepted one to be taken over.
std::optional<Refusal> refusalOfText(const std::string& text) {
    JsonDocument document;
    document.Parse(text.data(), text.size());
    EXPECT_FALSE(document.HasParseError()) << text;
    const std::string before = textOf(document);
    const auto refusal = refusalOf([&] { SingleRequest request(document); });
    EXPECT_EQ(refusal ? before : "null", textOf(document));
    return refusal;
}

TEST(SingleRequest, TakesAValidRequestOver) {
    const std::string text =
        R"({"jsonrpc":"2.0","id":7,"method":"closeSession","params":{"session_id":"_session1"}})";
    JsonDocument document;
    document.Parse(text.data(), text.size());
    const SingleRequest request(document);

    EXPECT_TRUE(document.IsNull());
    EXPECT_EQ(request.getMethod(), "closeSession");
    EXPECT_EQ(textOf(request.getParams()), R"({"session_id":"_session1"})");
    EXPECT_EQ(text, textOf(request.getRequest()));
}

TEST(SingleRequest, RefusesWhatIsNotAnObjectOrIsEmptyWithoutDetails) {
    for (const char* text : {"null", "true", "1", "\"text\"", "[]", "[1]", "{}"}) {
        EXPECT_EQ(refusalOfText(text), (Refusal{-32600, ""})) << text;
    }
}

TEST(SingleRequest, RefusesAMissingOrInvalidId) {
    EXPECT_EQ(refusalOfText(R"({"params":{}})"), invalidMember("id"));
    for (const char* id : {"null", "true", "1.5", "1.0", "1e0", "2147483648", "-2147483649",
                           "99999999999999999999", "[]", "{}"}) {
        EXPECT_EQ(refusalOfText(std::string(R"({"jsonrpc":"2.0","method":"m","id":)") + id + "}"),
                  invalidMember("id"))
            << id;
    }
}

TEST(SingleRequest, AcceptsIntegersOf32BitsAndStringsAsIds) {
    for (const char* id : {"0", "-0", "2147483647", "-2147483648", "\"\"", "\"a\\u0000b\""}) {
        EXPECT_EQ(refusalOfText(std::string(R"({"jsonrpc":"2.0","method":"m","id":)") + id + "}"),
                  std::nullopt)
            << id;
    }
}

TEST(SingleRequest, RefusesAnotherVersionThan20) {
    EXPECT_EQ(refusalOfText(R"({"id":1,"method":"m"})"), invalidMember("jsonrpc"));
    for (const char* version :
         {"2.0", "2", "null", "\"1.0\"", "\"2\"", "\"2.00\"", "\"\"", "\" 2.0\""}) {
        EXPECT_EQ(refusalOfText(std::string(R"({"id":1,"method":"m","jsonrpc":)") + version + "}"),
                  invalidMember("jsonrpc"))
            << version;
    }
}

TEST(SingleRequest, ReadsTheVersionUpToItsFirstNul) {
    EXPECT_EQ(refusalOfText(R"({"id":1,"method":"m","jsonrpc":"2.0\u0000x"})"), std::nullopt);
}

TEST(SingleRequest, RefusesAMissingOrInvalidMethod) {
    EXPECT_EQ(refusalOfText(R"({"id":1,"jsonrpc":"2.0"})"), invalidMember("method"));
    for (const char* method : {"null", "1", "[\"m\"]", "{}"}) {
        EXPECT_EQ(refusalOfText(std::string(R"({"id":1,"jsonrpc":"2.0","method":)") + method + "}"),
                  invalidMember("method"))
            << method;
    }
}

TEST(SingleRequest, ChecksIdThenVersionThenMethod) {
    EXPECT_EQ(refusalOfText(R"({"method":1,"jsonrpc":1,"id":null})"), invalidMember("id"));
    EXPECT_EQ(refusalOfText(R"({"method":1,"jsonrpc":1,"id":1})"), invalidMember("jsonrpc"));
}

TEST(SingleRequest, ComparesMemberNamesExactly) {
    EXPECT_EQ(refusalOfText(R"({"ID":1,"jsonrpc":"2.0","method":"m"})"), invalidMember("id"));
    EXPECT_EQ(refusalOfText(R"({"id\u0000":1,"jsonrpc":"2.0","method":"m"})"), invalidMember("id"));
}

TEST(SingleRequest, ReportsTheSourcePositionOfARefusal) {
    JsonDocument document;
    document.Parse("[]");
    try {
        SingleRequest request(document);
        FAIL() << "an array was accepted";
    } catch (const nQITRMCSHAREDCMN100::BasicError& error) {
        const std::string text = error.status()->json;
        EXPECT_NE(std::string::npos, text.find("SingleRequest.cpp\"")) << text;
        EXPECT_NE(std::string::npos, text.find("\"component\":\"qitrmcsvc\"")) << text;
    }
}

TEST(SingleRequest, ReturnsTheMethodUpToItsFirstNul) {
    const ParsedRequest request(R"({"jsonrpc":"2.0","id":1,"method":"ab\u0000c"})");
    EXPECT_EQ((*request).getMethod(), "ab");
    const ParsedRequest unnamed(R"({"jsonrpc":"2.0","id":1,"method":""})");
    EXPECT_EQ((*unnamed).getMethod(), "");
}

TEST(SingleRequest, ReturnsParamsOfAnyTypeAndNullForMissingOnes) {
    for (const char* params : {"null", "5", "[1,2]", "{\"a\":1}"}) {
        const ParsedRequest request(requestText("m", params));
        EXPECT_EQ(params, textOf((*request).getParams()));
    }
    const ParsedRequest request(R"({"jsonrpc":"2.0","id":1,"method":"m","Params":{}})");
    EXPECT_TRUE((*request).getParams().IsNull());
}

}  // namespace
}  // namespace nQITRMCWEBSVC100
