#include <cinttypes>
#include <cstdint>
#include <cstdio>
#include <limits>
#include <lua.hpp>

#include "stdint/luaopen_stdint.h"

// These functions must not own resources: a Lua error is a longjmp that skips destructors.

namespace {

// The differences between the two types: their names, texts and formats.
struct Signed {
    using Integer = std::int64_t;
    static constexpr const char* name = "i64";
    static constexpr const char* badConstructorArgument =
        "i64 constructor arg must be a number or a string";
    static constexpr const char* badOperand = "Can't get a i64 from argument";
    static constexpr const char* badText = "Failed to convert i64 to string";
    static constexpr const char* badHex = "Failed to print hex value of i64";

    static bool scan(const char* text, Integer* value) {
        long long scanned = 0;
        const bool found = std::sscanf(text, "%lli", &scanned) == 1;
        *value = scanned;
        return found;
    }
    static int print(char* buffer, std::size_t size, Integer value) {
        return std::snprintf(buffer, size, "%lli", static_cast<long long>(value));
    }
    // The quotient of the lowest value and -1 is out of range; it wraps like every other result.
    static bool isWrappingDivisor(Integer divisor) { return divisor == -1; }
};

struct Unsigned {
    using Integer = std::uint64_t;
    static constexpr const char* name = "u64";
    static constexpr const char* badConstructorArgument =
        "u64 constructor arg must be a number or a string";
    static constexpr const char* badOperand = "Can't get a u64 from argument";
    static constexpr const char* badText = "Failed to convert u64 to string";
    static constexpr const char* badHex = "Failed to print hex value of u64";

    static bool scan(const char* text, Integer* value) {
        unsigned long long scanned = 0;
        const bool found = std::sscanf(text, "%llu", &scanned) == 1;
        *value = scanned;
        return found;
    }
    static int print(char* buffer, std::size_t size, Integer value) {
        return std::snprintf(buffer, size, "%llu", static_cast<unsigned long long>(value));
    }
    static bool isWrappingDivisor(Integer) { return false; }
};

// Clamps explicitly: in C++, converting a double that is out of range is undefined behaviour.
template <typename Type>
typename Type::Integer fromDouble(double number) {
    using Integer = typename Type::Integer;
    using Limits = std::numeric_limits<Integer>;
    // Twice the largest power of two in the range: the smallest double above the range.
    const double end = 2.0 * static_cast<double>(Limits::max() / 2 + 1);
    if (number != number) {
        return 0;
    }
    if (number >= end) {
        return Limits::max();
    }
    if (number <= static_cast<double>(Limits::min())) {
        return Limits::min();
    }
    return static_cast<Integer>(number);
}

template <typename Type>
int push(lua_State* L, typename Type::Integer value) {
    using Integer = typename Type::Integer;
    *static_cast<Integer*>(lua_newuserdata(L, sizeof(Integer))) = value;
    luaL_getmetatable(L, Type::name);
    lua_setmetatable(L, -2);
    return 1;
}

template <typename Type>
typename Type::Integer checkValue(lua_State* L, int index) {
    return *static_cast<typename Type::Integer*>(luaL_checkudata(L, index, Type::name));
}

template <typename Type>
typename Type::Integer operand(lua_State* L, int index) {
    switch (lua_type(L, index)) {
        case LUA_TNUMBER:
            return fromDouble<Type>(lua_tonumber(L, index));
        case LUA_TUSERDATA:
            return checkValue<Type>(L, index);
        default:
            luaL_error(L, Type::badOperand);
            return 0;
    }
}

template <typename Type>
int construct(lua_State* L) {
    typename Type::Integer value = 0;
    if (lua_gettop(L) != 1) {
        return push<Type>(L, value);
    }
    switch (lua_type(L, 1)) {
        case LUA_TNUMBER:
            value = fromDouble<Type>(lua_tonumber(L, 1));
            break;
        case LUA_TSTRING:
            if (!Type::scan(lua_tostring(L, 1), &value)) {
                return luaL_error(L, "Unable to parse a number out of \"%s\"", lua_tostring(L, 1));
            }
            break;
        default:
            return luaL_error(L, Type::badConstructorArgument);
    }
    return push<Type>(L, value);
}

template <typename Type>
int add(lua_State* L) {
    const std::uint64_t left = operand<Type>(L, 1);
    return push<Type>(L, left + operand<Type>(L, 2));
}

template <typename Type>
int subtract(lua_State* L) {
    const std::uint64_t left = operand<Type>(L, 1);
    return push<Type>(L, left - operand<Type>(L, 2));
}

template <typename Type>
int multiply(lua_State* L) {
    const std::uint64_t left = operand<Type>(L, 1);
    return push<Type>(L, left * operand<Type>(L, 2));
}

template <typename Type>
int divide(lua_State* L) {
    const auto left = operand<Type>(L, 1);
    const auto right = operand<Type>(L, 2);
    if (right == 0) {
        return luaL_error(L, "attempt to divide by zero");
    }
    if (Type::isWrappingDivisor(right)) {
        return push<Type>(L, std::uint64_t{0} - left);
    }
    return push<Type>(L, left / right);
}

template <typename Type>
int remainder(lua_State* L) {
    const auto left = operand<Type>(L, 1);
    const auto right = operand<Type>(L, 2);
    if (right == 0) {
        return luaL_error(L, "attempt to perform 'n%%0'");
    }
    return push<Type>(L, Type::isWrappingDivisor(right) ? 0 : left % right);
}

template <typename Type>
int negate(lua_State* L) {
    return push<Type>(L, std::uint64_t{0} - operand<Type>(L, 1));
}

template <typename Type>
int equals(lua_State* L) {
    const auto left = operand<Type>(L, 1);
    lua_pushboolean(L, left == operand<Type>(L, 2));
    return 1;
}

template <typename Type>
int isLess(lua_State* L) {
    const auto left = operand<Type>(L, 1);
    lua_pushboolean(L, left < operand<Type>(L, 2));
    return 1;
}

template <typename Type>
int toText(lua_State* L) {
    char buffer[128];
    if (Type::print(buffer, sizeof buffer, checkValue<Type>(L, 1)) < 0) {
        return luaL_error(L, Type::badText);
    }
    lua_pushstring(L, buffer);
    return 1;
}

template <typename Type>
int toHexText(lua_State* L) {
    char buffer[128];
    const auto value = static_cast<unsigned long long>(checkValue<Type>(L, 1));
    if (std::snprintf(buffer, sizeof buffer, "%llx", value) < 0) {
        return luaL_error(L, Type::badHex);
    }
    lua_pushstring(L, buffer);
    return 1;
}

template <typename Type>
void makeMetatable(lua_State* L) {
    static const luaL_Reg operators[] = {
        {"__tostring", toText<Type>}, {"__add", add<Type>},    {"__sub", subtract<Type>},
        {"__mul", multiply<Type>},    {"__div", divide<Type>}, {"__mod", remainder<Type>},
        {"__unm", negate<Type>},      {"__eq", equals<Type>},  {"__lt", isLess<Type>},
        {nullptr, nullptr},
    };
    static const luaL_Reg methods[] = {{"hexstring", toHexText<Type>}, {nullptr, nullptr}};
    luaL_newmetatable(L, Type::name);
    luaL_register(L, nullptr, operators);
    lua_newtable(L);
    luaL_register(L, nullptr, methods);
    lua_setfield(L, -2, "__index");
    lua_pop(L, 1);
}

}  // namespace

extern "C" int luaopen_stdint(lua_State* L) {
    static const luaL_Reg functions[] = {
        {"u64", construct<Unsigned>}, {"i64", construct<Signed>}, {nullptr, nullptr}};
    makeMetatable<Unsigned>(L);
    makeMetatable<Signed>(L);
    luaL_register(L, "stdint", functions);
    return 1;
}
