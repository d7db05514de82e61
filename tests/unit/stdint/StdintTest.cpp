#include <gtest/gtest.h>

#include <lua.hpp>
#include <string>

#include "stdint/luaopen_stdint.h"

namespace {

class StdintTest : public testing::Test {
  protected:
    StdintTest() : L(luaL_newstate()) {
        luaL_openlibs(L);
        lua_pushcfunction(L, luaopen_stdint);
        lua_pushliteral(L, "stdint");
        lua_call(L, 1, 0);
    }
    ~StdintTest() override { lua_close(L); }

    // The text of an expression's value, or of the error that it raises, as "error: ...".
    std::string evaluate(const std::string& expression) {
        const std::string chunk =
            "local i64, u64 = stdint.i64, stdint.u64 return tostring(" + expression + ")";
        std::string prefix;
        if (luaL_loadbuffer(L, chunk.data(), chunk.size(), "=test") != 0 ||
            lua_pcall(L, 0, 1, 0) != 0) {
            prefix = "error: ";
        }
        std::string text = prefix + lua_tostring(L, -1);
        lua_settop(L, 0);
        return text;
    }

    lua_State* L;
};

TEST_F(StdintTest, AConstructorWithoutExactlyOneArgumentGivesZero) {
    EXPECT_EQ(evaluate("i64()"), "0");
    EXPECT_EQ(evaluate("i64(1, 2)"), "0");
    EXPECT_EQ(evaluate("u64()"), "0");
    EXPECT_EQ(evaluate("u64(1, 2)"), "0");
}

TEST_F(StdintTest, TextsOfTheWholeRangeAreRead) {
    EXPECT_EQ(evaluate("u64('18446744073709551615')"), "18446744073709551615");
    EXPECT_EQ(evaluate("i64('9223372036854775807')"), "9223372036854775807");
    EXPECT_EQ(evaluate("i64('-9223372036854775808')"), "-9223372036854775808");
    EXPECT_EQ(evaluate("i64('0xff')"), "255");
    EXPECT_EQ(evaluate("u64('0xff')"), "0");
}

TEST_F(StdintTest, NumbersAreTruncatedTowardsZeroAndClamped) {
    EXPECT_EQ(evaluate("i64(7.9)"), "7");
    EXPECT_EQ(evaluate("i64(-7.9)"), "-7");
    EXPECT_EQ(evaluate("u64(7.9)"), "7");
    EXPECT_EQ(evaluate("i64(2^63)"), "9223372036854775807");
    EXPECT_EQ(evaluate("i64(-2^70)"), "-9223372036854775808");
    EXPECT_EQ(evaluate("u64(2^64)"), "18446744073709551615");
    EXPECT_EQ(evaluate("u64(2^63)"), "9223372036854775808");
    EXPECT_EQ(evaluate("u64(-1)"), "0");
    EXPECT_EQ(evaluate("i64(0/0)"), "0");
}

TEST_F(StdintTest, ATextWithoutANumberIsAnError) {
    EXPECT_EQ(evaluate("i64('abc')"), "error: test:1: Unable to parse a number out of \"abc\"");
    EXPECT_EQ(evaluate("u64('')"), "error: test:1: Unable to parse a number out of \"\"");
}

TEST_F(StdintTest, AnArgumentOfAnotherTypeIsAnError) {
    EXPECT_EQ(evaluate("i64(true)"),
              "error: test:1: i64 constructor arg must be a number or a string");
    EXPECT_EQ(evaluate("u64({})"),
              "error: test:1: u64 constructor arg must be a number or a string");
    EXPECT_EQ(evaluate("i64(i64(1))"),
              "error: test:1: i64 constructor arg must be a number or a string");
}

TEST_F(StdintTest, HexTextIsLowerCaseWithoutPrefix) {
    EXPECT_EQ(evaluate("i64(-1):hexstring()"), "ffffffffffffffff");
    EXPECT_EQ(evaluate("u64(2748):hexstring()"), "abc");
}

TEST_F(StdintTest, UnaryMinusIsTheTwosComplement) {
    EXPECT_EQ(evaluate("-u64(1)"), "18446744073709551615");
    EXPECT_EQ(evaluate("-i64(5)"), "-5");
    EXPECT_EQ(evaluate("-i64('-9223372036854775808')"), "-9223372036854775808");
}

TEST_F(StdintTest, PlainNumbersAreAllowedOnEitherSide) {
    EXPECT_EQ(evaluate("i64(7) + 1"), "8");
    EXPECT_EQ(evaluate("1 + i64(7)"), "8");
    EXPECT_EQ(evaluate("getmetatable(1 + i64(7)) == getmetatable(i64(0))"), "true");
    EXPECT_EQ(evaluate("10 - u64(4)"), "6");
    EXPECT_EQ(evaluate("u64(4) * 10"), "40");
}

TEST_F(StdintTest, ArithmeticWraps) {
    EXPECT_EQ(evaluate("i64('9223372036854775807') + 1"), "-9223372036854775808");
    EXPECT_EQ(evaluate("u64('18446744073709551615') + 1"), "0");
    EXPECT_EQ(evaluate("u64(0) - 1"), "18446744073709551615");
    EXPECT_EQ(evaluate("i64('9223372036854775807') * 2"), "-2");
}

TEST_F(StdintTest, DivisionTruncates) {
    EXPECT_EQ(evaluate("i64(-7) % 2"), "-1");
    EXPECT_EQ(evaluate("i64(-7) / 2"), "-3");
    EXPECT_EQ(evaluate("u64('18446744073709551615') / 2"), "9223372036854775807");
    EXPECT_EQ(evaluate("u64('18446744073709551615') % 2"), "1");
}

TEST_F(StdintTest, DivisionByZeroIsALuaError) {
    for (const char* expression : {"i64(1) / 0", "u64(1) / 0", "i64(1) % 0", "u64(1) % 0"}) {
        EXPECT_EQ(evaluate(expression).find("error: test:1: attempt to "), 0u) << expression;
    }
}

TEST_F(StdintTest, TheLowestValueDividedByMinusOneWraps) {
    EXPECT_EQ(evaluate("i64('-9223372036854775808') / -1"), "-9223372036854775808");
    EXPECT_EQ(evaluate("i64('-9223372036854775808') % -1"), "0");
}

TEST_F(StdintTest, ComparesInTheOrderOfTheType) {
    EXPECT_EQ(evaluate("i64(-1) < i64(1)"), "true");
    EXPECT_EQ(evaluate("-u64(1) < u64(1)"), "false");
    EXPECT_EQ(evaluate("i64(2) <= i64(2)"), "true");
    EXPECT_EQ(evaluate("i64(2) == i64(2)"), "true");
    EXPECT_EQ(evaluate("u64(2) == u64(3)"), "false");
    EXPECT_EQ(evaluate("u64(2) == i64(2)"), "false");
}

// The interpreter does not call a metamethod to compare values of different types.
TEST_F(StdintTest, PlainNumbersAreNotCompared) {
    EXPECT_EQ(evaluate("i64(7) < 8"), "error: test:1: attempt to compare userdata with number");
    EXPECT_EQ(evaluate("8 < i64(7)"), "error: test:1: attempt to compare number with userdata");
    EXPECT_EQ(evaluate("i64(7) >= 6"), "error: test:1: attempt to compare number with userdata");
    EXPECT_EQ(evaluate("6 <= u64(7)"), "error: test:1: attempt to compare number with userdata");
    EXPECT_EQ(evaluate("i64(7) == 7"), "false");
    EXPECT_EQ(evaluate("7 ~= u64(7)"), "true");
}

// The operators themselves take plain numbers, as arithmetic does.
TEST_F(StdintTest, TheComparisonsOfTheMetatableTakePlainNumbers) {
    EXPECT_EQ(evaluate("getmetatable(i64(0)).__lt(i64(-7), 6.9)"), "true");
    EXPECT_EQ(evaluate("getmetatable(i64(0)).__lt(6.9, i64(6))"), "false");
    EXPECT_EQ(evaluate("getmetatable(u64(0)).__eq(7.9, u64(7))"), "true");
    EXPECT_EQ(evaluate("getmetatable(i64(0)).__eq(i64(-7), 7)"), "false");
}

TEST_F(StdintTest, TheTypesDoNotMix) {
    EXPECT_EQ(evaluate("u64(1) < i64(2)"), "error: test:1: attempt to compare two userdata values");
    EXPECT_EQ(evaluate("i64(1) + u64(1)"),
              "error: test:1: bad argument #2 to '?' (i64 expected, got userdata)");
}

TEST_F(StdintTest, AnOperandOfAnotherTypeIsAnError) {
    EXPECT_EQ(evaluate("i64(1) + {}"), "error: test:1: Can't get a i64 from argument");
    EXPECT_EQ(evaluate("u64(1) - true"), "error: test:1: Can't get a u64 from argument");
}

TEST_F(StdintTest, AMethodOnAnotherTypeIsATypeError) {
    EXPECT_EQ(evaluate("i64(1).hexstring(u64(1))").find("error: "), 0u);
    EXPECT_EQ(evaluate("i64(1).hexstring(5)").find("error: "), 0u);
}

}  // namespace
