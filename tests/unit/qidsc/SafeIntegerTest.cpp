#include "qi/dsc/SafeInteger.h"

#include <gtest/gtest.h>

#include <string>

using namespace qi::dsc;

namespace {

template <typename Call>
void expectOutOfRangeAt(std::int32_t line, Call call) {
    try {
        call();
        ADD_FAILURE() << "nothing thrown";
    } catch (const exception::OutOfRange& error) {
        EXPECT_EQ(error.line, line);
        EXPECT_EQ(std::string(error.file), "src/qi/dsc/SafeInteger.h");
    }
}

}  // namespace

TEST(SafeInteger, AddsUpToTheLargestSize) {
    EXPECT_EQ(addOne(0), 1u);
    EXPECT_EQ(addOne(0xFFFFFFFE), 0xFFFFFFFFu);
    expectOutOfRangeAt(125, [] { addOne(0xFFFFFFFF); });
    expectOutOfRangeAt(125, [] { addOne(static_cast<std::size_t>(-1)); });
}

TEST(SafeInteger, MultipliesUpTo32Bits) {
    EXPECT_EQ(multiply(0, 4), 0u);
    EXPECT_EQ(multiply(0x3FFFFFFF, 4), 0xFFFFFFFCu);
    EXPECT_EQ(multiply(0xFFFFFFFF, 1), 0xFFFFFFFFu);
    EXPECT_EQ(multiply(0x10000, 0xFFFF), 0xFFFF0000u);
    expectOutOfRangeAt(163, [] { multiply(0x40000000, 4); });
    expectOutOfRangeAt(163, [] { multiply(0x10000, 0x10000); });
    expectOutOfRangeAt(163, [] { multiply(0xFFFFFFFF, 0xFFFFFFFF); });
}
