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

// Also expects a refused value to stay as it was, and an accepted one to be taken.
std::optional<Refusal> refusalOfText(const std::string& text) {
    JsonDocument document;
    document.Parse(text.data(), text.size());
    EXPECT_FALSE(document.HasParseError()) << text;
    const std::string before = textOf(document);
    const auto refusal = refusalOf([&] { SingleRequest request(document); });
    EXPECT_EQ(refusal ? before : "null", textOf(document));
    return refusal;
}

TEST(SingleRequest, TakesASoundRequestOver) {
    const std::string text =
        R"({"jsonrpc":"2.0","id":7,"method":"closeSession","params":{"session_id":"_session1"}})";
    JsonDocument document;
    document.Parse(text.data(), text.size());
    const SingleRequest request(document);

    EXPECT_TRUE(document.IsNull());
    EXPECT_EQ("closeSession", request.getMethod());
    EXPECT_EQ(R"({"session_id":"_session1"})", textOf(request.getParams()));
    EXPECT_EQ(text, textOf(request.getRequest()));
}

TEST(SingleRequest, RefusesWhatIsNotAnObjectOrIsEmptyWithoutDetails) {
    for (const char* text : {"null", "true", "1", "\"text\"", "[]", "[1]", "{}"})
        EXPECT_EQ((Refusal{-32600, ""}), refusalOfText(text)) << text;
}

TEST(SingleRequest, RefusesAnAbsentOrUnfitId) {
    EXPECT_EQ(invalidMember("id"), refusalOfText(R"({"params":{}})"));
    for (const char* id : {"null", "true", "1.5", "1.0", "1e0", "2147483648", "-2147483649",
                           "99999999999999999999", "[]", "{}"}) {
        EXPECT_EQ(invalidMember("id"),
                  refusalOfText(std::string(R"({"jsonrpc":"2.0","method":"m","id":)") + id + "}"))
            << id;
    }
}

TEST(SingleRequest, AcceptsIntegersOf32BitsAndStringsAsIds) {
    for (const char* id : {"0", "-0", "2147483647", "-2147483648", "\"\"", "\"a\\u0000b\""}) {
        EXPECT_EQ(std::nullopt,
                  refusalOfText(std::string(R"({"jsonrpc":"2.0","method":"m","id":)") + id + "}"))
            << id;
    }
}

TEST(SingleRequest, RefusesAnotherVersionThan20) {
    EXPECT_EQ(invalidMember("jsonrpc"), refusalOfText(R"({"id":1,"method":"m"})"));
    for (const char* version :
         {"2.0", "2", "null", "\"1.0\"", "\"2\"", "\"2.00\"", "\"\"", "\" 2.0\""}) {
        EXPECT_EQ(invalidMember("jsonrpc"),
                  refusalOfText(std::string(R"({"id":1,"method":"m","jsonrpc":)") + version + "}"))
            << version;
    }
}

TEST(SingleRequest, ReadsTheVersionUpToItsFirstNul) {
    EXPECT_EQ(std::nullopt, refusalOfText(R"({"id":1,"method":"m","jsonrpc":"2.0\u0000x"})"));
}

TEST(SingleRequest, RefusesAnAbsentOrUnfitMethod) {
    EXPECT_EQ(invalidMember("method"), refusalOfText(R"({"id":1,"jsonrpc":"2.0"})"));
    for (const char* method : {"null", "1", "[\"m\"]", "{}"}) {
        EXPECT_EQ(invalidMember("method"),
                  refusalOfText(std::string(R"({"id":1,"jsonrpc":"2.0","method":)") + method + "}"))
            << method;
    }
}

TEST(SingleRequest, ComplainsOfIdThenVersionThenMethod) {
    EXPECT_EQ(invalidMember("id"), refusalOfText(R"({"method":1,"jsonrpc":1,"id":null})"));
    EXPECT_EQ(invalidMember("jsonrpc"), refusalOfText(R"({"method":1,"jsonrpc":1,"id":1})"));
}

TEST(SingleRequest, ComparesMemberNamesExactly) {
    EXPECT_EQ(invalidMember("id"), refusalOfText(R"({"ID":1,"jsonrpc":"2.0","method":"m"})"));
    EXPECT_EQ(invalidMember("id"), refusalOfText(R"({"id\u0000":1,"jsonrpc":"2.0","method":"m"})"));
}

TEST(SingleRequest, SaysWhereItRefused) {
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

TEST(SingleRequest, GivesTheMethodUpToItsFirstNul) {
    const ParsedRequest request(R"({"jsonrpc":"2.0","id":1,"method":"ab\u0000c"})");
    EXPECT_EQ("ab", (*request).getMethod());
    const ParsedRequest unnamed(R"({"jsonrpc":"2.0","id":1,"method":""})");
    EXPECT_EQ("", (*unnamed).getMethod());
}

TEST(SingleRequest, GivesParamsOfAnyTypeAndNullForNone) {
    for (const char* params : {"null", "5", "[1,2]", "{\"a\":1}"}) {
        const ParsedRequest request(requestText("m", params));
        EXPECT_EQ(params, textOf((*request).getParams()));
    }
    const ParsedRequest request(R"({"jsonrpc":"2.0","id":1,"method":"m","Params":{}})");
    EXPECT_TRUE((*request).getParams().IsNull());
}

}  // namespace
}  // namespace nQITRMCWEBSVC100
