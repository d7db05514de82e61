#include <vector>

#include "Reading.h"

namespace {

// The offset of a member's value, or -1.
long memberOffset(const char* text, const char* key) {
    const char* found = jsonz_findMember(text, key);
    return found != nullptr ? found - text : -1;
}

std::vector<std::string> elements(const char* text) {
    std::vector<std::string> result;
    const char* element = jsonz_firstElement(text);
    while (element != nullptr) {
        const char* end = jsonz_readValue(element, nullptr);
        if (end == nullptr) {
            result.push_back("fault");
            break;
        }
        result.emplace_back(element, end);
        element = jsonz_nextElement(end);
    }
    return result;
}

using Texts = std::vector<std::string>;

}  // namespace

TEST(JsonzFindMember, FindsTheFirstMatch) {
    const char* text = " { \"a\" : 1, \"b\": [2], \"a\":3}";
    EXPECT_EQ(memberOffset(text, "a"), 9);
    EXPECT_EQ(memberOffset(text, "b"), 17);
    EXPECT_EQ(memberOffset(text, "c"), -1);
    EXPECT_EQ(memberOffset(text, ""), -1);
    EXPECT_EQ(memberOffset("{\"\":1}", ""), 4);
}

TEST(JsonzFindMember, SearchesItsOwnLevelOnly) {
    EXPECT_EQ(memberOffset("{\"x\":{\"a\":1},\"y\":[{\"a\":2}],\"a\":3}", "a"), 31);
    EXPECT_EQ(memberOffset("{\"x\":{\"a\":1}}", "a"), -1);
    EXPECT_EQ(memberOffset("{\"x\":\"a\"}", "a"), -1);
}

TEST(JsonzFindMember, FindsNothingOutsideObjects) {
    EXPECT_EQ(jsonz_findMember("[\"a\",1]", "a"), nullptr);
    EXPECT_EQ(jsonz_findMember("\"a\":1", "a"), nullptr);
    EXPECT_EQ(jsonz_findMember(",\"a\":1", "a"), nullptr);
    EXPECT_EQ(jsonz_findMember("{}", "a"), nullptr);
    EXPECT_EQ(jsonz_findMember("", "a"), nullptr);
    EXPECT_EQ(jsonz_findMember(nullptr, "a"), nullptr);
}

TEST(JsonzFindMember, ResolvesEscapesInKeys) {
    EXPECT_EQ(memberOffset("{\"\\u0061\\/\\n\":1}", "a/\n"), 14);
    EXPECT_EQ(memberOffset("{\"\\u00e9\":1}", "\xc3\xa9"), 10);
    EXPECT_EQ(memberOffset("{\"\\ud83d\\ude00\":1}", "\xf0\x9f\x98\x80"), 16);
    EXPECT_EQ(memberOffset("{\"a\\u0000b\":1}", "a"), -1);
    EXPECT_EQ(memberOffset("{\"\\u0000\":1}", ""), -1);
}

TEST(JsonzFindMember, SkipsKeysThatDecodeToNothing) {
    EXPECT_EQ(memberOffset("{\"\\ud83d\":1,\"a\":2}", "a"), 16);
}

TEST(JsonzFindMember, ComparesWholeKeys) {
    EXPECT_EQ(memberOffset("{\"ab\":1,\"a\":2}", "a"), 12);
    EXPECT_EQ(memberOffset("{\"a\":1,\"ab\":2}", "ab"), 12);
}

TEST(JsonzFindMember, StopsAtAFault) {
    EXPECT_EQ(memberOffset("{\"a\":1,\"b\":x,\"c\":3}", "a"), 5);
    EXPECT_EQ(memberOffset("{\"a\":1,\"b\":x,\"c\":3}", "b"), 11);
    EXPECT_EQ(memberOffset("{\"a\":1,\"b\":x,\"c\":3}", "c"), -1);
    EXPECT_EQ(memberOffset("{\"a\":1 \"c\":3}", "c"), -1);
    EXPECT_EQ(memberOffset("{\"a\" 1,\"c\":3}", "c"), -1);
    EXPECT_EQ(memberOffset("{\"a\":1,", "c"), -1);
    EXPECT_EQ(memberOffset("{\"a\":1", "c"), -1);
}

TEST(JsonzElements, WalksAnArray) {
    EXPECT_EQ(elements("[1, \"b\" ,[2,3],{}]"), (Texts{"1", "\"b\"", "[2,3]", "{}"}));
    EXPECT_EQ(elements(" [ null ] , 5"), (Texts{"null"}));
}

TEST(JsonzElements, WhatIsEmptyOrNotAnArrayHasNoFirstElement) {
    EXPECT_EQ(jsonz_firstElement("[]"), nullptr);
    EXPECT_EQ(jsonz_firstElement("[ \n]"), nullptr);
    EXPECT_EQ(jsonz_firstElement("["), nullptr);
    EXPECT_EQ(jsonz_firstElement("{\"a\":1}"), nullptr);
    EXPECT_EQ(jsonz_firstElement("1"), nullptr);
    EXPECT_EQ(jsonz_firstElement(nullptr), nullptr);
}

TEST(JsonzElements, WalkEndsWhereNoCommaFollows) {
    EXPECT_EQ(elements("[1 2]"), (Texts{"1"}));
    EXPECT_EQ(elements("[1,]"), (Texts{"1"}));
    EXPECT_EQ(elements("[1,"), (Texts{"1"}));
    EXPECT_EQ(elements("[1,x]"), (Texts{"1", "fault"}));
    EXPECT_EQ(jsonz_nextElement(nullptr), nullptr);
}

TEST(JsonzGetString, ReturnsTheTextOrTheDefault) {
    std::size_t length = 77;
    const char* end = nullptr;
    const char* text = " \"a\\nb\",";
    EXPECT_EQ(jsonz_getString(text, "none", &length, &end), text + 2);
    EXPECT_EQ(length, 4u);
    EXPECT_EQ(end, text + 7);

    EXPECT_STREQ(jsonz_getString("12", "none", &length), "none");
    EXPECT_EQ(length, 4u);
    EXPECT_STREQ(jsonz_getString(nullptr, "", &length, &end), "");
    EXPECT_EQ(length, 0u);
    EXPECT_EQ(end, nullptr);
    EXPECT_EQ(jsonz_getString("\"open", nullptr, &length, &end), nullptr);
    EXPECT_EQ(length, 0u);
}
