#include "Reading.h"

using jsonz_test::expectBareFault;
using jsonz_test::expectFault;
using jsonz_test::Reading;

namespace {

std::string repeated(const std::string& part, std::size_t times) {
    std::string result;
    result.reserve(part.size() * times);
    for (std::size_t i = 0; i < times; ++i) {
        result += part;
    }
    return result;
}

}  // namespace

TEST(JsonzContainer, ReadsCompleteArraysAndObjects) {
    const Reading array(" [1, \"a\" ,[ ] ,{ }, null] ,");
    EXPECT_EQ(array.value.type, 5);
    EXPECT_EQ(array.offset(array.value.text), 1);
    EXPECT_EQ(array.consumed, 25);
    const Reading object("{ \"a\" : 1 , \"b\":{\"c\":[true]}}x");
    EXPECT_EQ(object.value.type, 6);
    EXPECT_EQ(object.offset(object.value.text), 0);
    EXPECT_EQ(object.consumed, 29);
    EXPECT_EQ(Reading("[]").consumed, 2);
    EXPECT_EQ(Reading("{}").consumed, 2);
}

TEST(JsonzContainer, FaultInAnArrayIsReported) {
    expectFault("[1,2,]", 5, 8);
    expectFault("[1,2, ]", 6, 8);
    expectFault("[1 2]", 3, 6);
    expectFault("[1", 2, 4);
    expectFault("[1}", 2, 6);
    expectFault("[1,x]", 3, 2);
    expectFault("[\"\\x\"]", 3, 7);
    expectFault("[", 1, 2);
    expectFault("[,]", 1, 2);
}

TEST(JsonzContainer, FaultInANestedArrayIsReported) {
    expectFault("[[1,2,]]", 6, 8);
    expectFault("[[[1 2]]]", 5, 6);
    expectFault("[[1]", 4, 4);
}

TEST(JsonzContainer, FaultAfterAMemberIsReported) {
    expectFault("{\"a\":1", 6, 3);
    expectFault("{\"a\":1,}", 7, 8);
    expectFault("{\"a\":1 \"b\":2}", 7, 6);
    expectFault("[{\"a\":1]", 7, 6);
}

TEST(JsonzContainer, FaultInAMemberIsReportedWithoutDetails) {
    expectBareFault("{\"a\":x}");
    expectBareFault("{\"a\" 1}");
    expectBareFault("{a:1}");
    expectBareFault("{\"a\":[1,]}");
    expectBareFault("{\"a\":{\"b\":1,}}");
    expectBareFault("{\"a\":1,2}");
    expectBareFault("[{\"a\":x}]");
    expectBareFault("{\"a\":[x");
    expectBareFault("{");
}

TEST(JsonzContainer, FaultAfterANestedObjectIsReportedForTheArray) {
    expectFault("[{\"a\":1} 2]", 9, 6);
    expectFault("[{\"a\":[1]},]", 11, 8);
}

TEST(JsonzContainer, ReadsAnyDepthWithoutOverflowingTheStack) {
    constexpr std::size_t depth = 4000000;
    const std::string arrays = repeated("[", depth) + repeated("]", depth);
    EXPECT_EQ(Reading(arrays.c_str()).consumed, static_cast<long>(arrays.size()));
    const std::string mixed = repeated("[{\"\":", depth / 2) + "1" + repeated("}]", depth / 2);
    EXPECT_EQ(Reading(mixed.c_str()).consumed, static_cast<long>(mixed.size()));
}

TEST(JsonzContainer, DistinguishesArraysAndObjectsAtAnyDepth) {
    // 4096 levels are held without heap memory; the tested faults are below and above that.
    for (std::size_t depth : {4094u, 4095u, 4096u, 4097u, 70000u}) {
        SCOPED_TRACE(depth);
        const std::string open = repeated("[", depth);
        const std::string close = repeated("]", depth);
        EXPECT_EQ(Reading((open + "{}" + close).c_str()).value.type, 5);
        expectFault((open + "1}" + close).c_str(), static_cast<long>(depth) + 1, 6);
        expectFault(open.c_str(), static_cast<long>(depth), 2);
        const std::string halfOpen = open + "1" + repeated("]", depth - 1);
        expectFault(halfOpen.c_str(), static_cast<long>(halfOpen.size()), 4);
        expectBareFault((repeated("{\"k\":", depth) + "]").c_str());
    }
}

TEST(JsonzContainer, EndOfContainerIsItsClosingBracket) {
    const char* text = " [1,[2]],";
    EXPECT_EQ(jsonz_endOfContainer(text), text + 7);
    const char* object = "{\"]\":\"}\"}";
    EXPECT_EQ(jsonz_endOfContainer(object), object + 8);
    EXPECT_EQ(jsonz_endOfContainer("[1"), nullptr);
    EXPECT_EQ(jsonz_endOfContainer("\"[]\""), nullptr);
    EXPECT_EQ(jsonz_endOfContainer("1"), nullptr);
    EXPECT_EQ(jsonz_endOfContainer(nullptr), nullptr);
}
