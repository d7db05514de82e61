#include <array>
#include <cstdint>
#include <cstring>

#include "Api.h"

namespace {

struct Item {
    const char* enumeration;
    const char* name;
    std::int32_t value;
};

constexpr std::array<Item, 19> items{{
    {"ReservationAccess", "ReadOnly", 1},
    {"ReservationAccess", "ReadWrite", 3},
    {"DataType", "Bool", 1},
    {"DataType", "Double", 2},
    {"DataType", "Int32", 3},
    {"DataType", "Int64", 4},
    {"DataType", "String", 5},
    {"DataType", "UInt32", 6},
    {"DataType", "UInt64", 7},
    {"DataType", "BoolArray", 8},
    {"DataType", "DoubleArray", 9},
    {"DataType", "Int32Array", 10},
    {"DataType", "Int64Array", 11},
    {"DataType", "StringArray", 12},
    {"DataType", "UInt32Array", 13},
    {"DataType", "UInt64Array", 14},
    {"PropertyAccess", "ReadOnly", 1},
    {"PropertyAccess", "WriteOnly", 2},
    {"PropertyAccess", "ReadWrite", 3},
}};

bool same(const char* left, const char* right) {
    return left != nullptr && std::strcmp(left, right) == 0;
}

}  // namespace

std::int32_t nQITRMCAPI100_translateStaticEnumStringToValue(const char* enumeration,
                                                            const char* item) {
    for (const Item& known : items) {
        if (same(enumeration, known.enumeration) && same(item, known.name)) {
            return known.value;
        }
    }
    return 0;
}

const char* nQITRMCAPI100_translateStaticEnumValueToString(const char* enumeration,
                                                           std::int32_t value) {
    for (const Item& known : items) {
        if (same(enumeration, known.enumeration) && value == known.value) {
            return known.name;
        }
    }
    return "";
}
