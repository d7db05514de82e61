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
    EXPECT_EQ("0", evaluate("i64()"));
    EXPECT_EQ("0", evaluate("i64(1, 2)"));
    EXPECT_EQ("0", evaluate("u64()"));
    EXPECT_EQ("0", evaluate("u64(1, 2)"));
}

TEST_F(StdintTest, TextsOfTheWholeRangeAreRead) {
    EXPECT_EQ("18446744073709551615", evaluate("u64('18446744073709551615')"));
    EXPECT_EQ("9223372036854775807", evaluate("i64('9223372036854775807')"));
    EXPECT_EQ("-9223372036854775808", evaluate("i64('-9223372036854775808')"));
    EXPECT_EQ("255", evaluate("i64('0xff')"));
    EXPECT_EQ("0", evaluate("u64('0xff')"));
}

TEST_F(StdintTest, NumbersAreTruncatedTowardsZeroAndClamped) {
    EXPECT_EQ("7", evaluate("i64(7.9)"));
    EXPECT_EQ("-7", evaluate("i64(-7.9)"));
    EXPECT_EQ("7", evaluate("u64(7.9)"));
    EXPECT_EQ("9223372036854775807", evaluate("i64(2^63)"));
    EXPECT_EQ("-9223372036854775808", evaluate("i64(-2^70)"));
    EXPECT_EQ("18446744073709551615", evaluate("u64(2^64)"));
    EXPECT_EQ("9223372036854775808", evaluate("u64(2^63)"));
    EXPECT_EQ("0", evaluate("u64(-1)"));
    EXPECT_EQ("0", evaluate("i64(0/0)"));
}

TEST_F(StdintTest, ATextWithoutANumberIsAnError) {
    EXPECT_EQ("error: test:1: Unable to parse a number out of \"abc\"", evaluate("i64('abc')"));
    EXPECT_EQ("error: test:1: Unable to parse a number out of \"\"", evaluate("u64('')"));
}

TEST_F(StdintTest, AnArgumentOfAnotherTypeIsAnError) {
    EXPECT_EQ("error: test:1: i64 constructor arg must be a number or a string",
              evaluate("i64(true)"));
    EXPECT_EQ("error: test:1: u64 constructor arg must be a number or a string",
              evaluate("u64({})"));
    EXPECT_EQ("error: test:1: i64 constructor arg must be a number or a string",
              evaluate("i64(i64(1))"));
}

TEST_F(StdintTest, HexTextIsLowerCaseWithoutPrefix) {
    EXPECT_EQ("ffffffffffffffff", evaluate("i64(-1):hexstring()"));
    EXPECT_EQ("abc", evaluate("u64(2748):hexstring()"));
}

TEST_F(StdintTest, UnaryMinusIsTheTwosComplement) {
    EXPECT_EQ("18446744073709551615", evaluate("-u64(1)"));
    EXPECT_EQ("-5", evaluate("-i64(5)"));
    EXPECT_EQ("-9223372036854775808", evaluate("-i64('-9223372036854775808')"));
}

TEST_F(StdintTest, PlainNumbersMixOnEitherSide) {
    EXPECT_EQ("8", evaluate("i64(7) + 1"));
    EXPECT_EQ("8", evaluate("1 + i64(7)"));
    EXPECT_EQ("true", evaluate("getmetatable(1 + i64(7)) == getmetatable(i64(0))"));
    EXPECT_EQ("6", evaluate("10 - u64(4)"));
    EXPECT_EQ("40", evaluate("u64(4) * 10"));
}

TEST_F(StdintTest, ArithmeticWraps) {
    EXPECT_EQ("-9223372036854775808", evaluate("i64('9223372036854775807') + 1"));
    EXPECT_EQ("0", evaluate("u64('18446744073709551615') + 1"));
    EXPECT_EQ("18446744073709551615", evaluate("u64(0) - 1"));
    EXPECT_EQ("-2", evaluate("i64('9223372036854775807') * 2"));
}

TEST_F(StdintTest, DivisionTruncates) {
    EXPECT_EQ("-1", evaluate("i64(-7) % 2"));
    EXPECT_EQ("-3", evaluate("i64(-7) / 2"));
    EXPECT_EQ("9223372036854775807", evaluate("u64('18446744073709551615') / 2"));
    EXPECT_EQ("1", evaluate("u64('18446744073709551615') % 2"));
}

TEST_F(StdintTest, DivisionByZeroIsALuaError) {
    for (const char* expression : {"i64(1) / 0", "u64(1) / 0", "i64(1) % 0", "u64(1) % 0"}) {
        EXPECT_EQ(0u, evaluate(expression).find("error: test:1: attempt to ")) << expression;
    }
}

TEST_F(StdintTest, TheLowestValueDividedByMinusOneWraps) {
    EXPECT_EQ("-9223372036854775808", evaluate("i64('-9223372036854775808') / -1"));
    EXPECT_EQ("0", evaluate("i64('-9223372036854775808') % -1"));
}

TEST_F(StdintTest, ComparesInTheTypesOwnOrder) {
    EXPECT_EQ("true", evaluate("i64(-1) < i64(1)"));
    EXPECT_EQ("false", evaluate("-u64(1) < u64(1)"));
    EXPECT_EQ("true", evaluate("i64(2) <= i64(2)"));
    EXPECT_EQ("true", evaluate("i64(2) == i64(2)"));
    EXPECT_EQ("false", evaluate("u64(2) == u64(3)"));
    EXPECT_EQ("false", evaluate("u64(2) == i64(2)"));
}

// The interpreter compares values of different types without the help of either.
TEST_F(StdintTest, PlainNumbersAreNotCompared) {
    EXPECT_EQ("error: test:1: attempt to compare userdata with number", evaluate("i64(7) < 8"));
    EXPECT_EQ("error: test:1: attempt to compare number with userdata", evaluate("8 < i64(7)"));
    EXPECT_EQ("error: test:1: attempt to compare number with userdata", evaluate("i64(7) >= 6"));
    EXPECT_EQ("error: test:1: attempt to compare number with userdata", evaluate("6 <= u64(7)"));
    EXPECT_EQ("false", evaluate("i64(7) == 7"));
    EXPECT_EQ("true", evaluate("7 ~= u64(7)"));
}

// The operators themselves take plain numbers, as arithmetic does.
TEST_F(StdintTest, TheComparisonsOfTheMetatableTakePlainNumbers) {
    EXPECT_EQ("true", evaluate("getmetatable(i64(0)).__lt(i64(-7), 6.9)"));
    EXPECT_EQ("false", evaluate("getmetatable(i64(0)).__lt(6.9, i64(6))"));
    EXPECT_EQ("true", evaluate("getmetatable(u64(0)).__eq(7.9, u64(7))"));
    EXPECT_EQ("false", evaluate("getmetatable(i64(0)).__eq(i64(-7), 7)"));
}

TEST_F(StdintTest, TheTypesDoNotMix) {
    EXPECT_EQ("error: test:1: attempt to compare two userdata values", evaluate("u64(1) < i64(2)"));
    EXPECT_EQ("error: test:1: bad argument #2 to '?' (i64 expected, got userdata)",
              evaluate("i64(1) + u64(1)"));
}

TEST_F(StdintTest, AnOperandOfAnotherTypeIsAnError) {
    EXPECT_EQ("error: test:1: Can't get a i64 from argument", evaluate("i64(1) + {}"));
    EXPECT_EQ("error: test:1: Can't get a u64 from argument", evaluate("u64(1) - true"));
}

TEST_F(StdintTest, AMethodOnAStrangerIsATypeError) {
    EXPECT_EQ(0u, evaluate("i64(1).hexstring(u64(1))").find("error: "));
    EXPECT_EQ(0u, evaluate("i64(1).hexstring(5)").find("error: "));
}

}  // namespace
