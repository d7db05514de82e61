#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <variant>
#include <vector>

namespace simulator {

// The numbers of the enumeration "DataType".
enum class DataType : std::int32_t {
    Boolean = 1,
    Real = 2,
    Int32 = 3,
    Int64 = 4,
    Text = 5,
    Uint32 = 6,
    Uint64 = 7,
    BooleanArray = 8,
    RealArray = 9,
    Int32Array = 10,
    Int64Array = 11,
    TextArray = 12,
    Uint32Array = 13,
    Uint64Array = 14
};

bool isArray(DataType type);
// The type of the elements of an array type, and the other way round.
DataType elementType(DataType type);
DataType arrayType(DataType type);
// The name in the enumeration "DataType".
std::string typeName(DataType type);
std::optional<DataType> typeNamed(std::string_view name);

// The elements of one value. It is a type of its own because a std::variant of vectors alone does
// not survive a copy that runs out of memory: the library takes it for one that always has a value.
template <typename Item>
struct List : std::vector<Item> {
    using std::vector<Item>::vector;
    List(std::vector<Item> items) : std::vector<Item>(std::move(items)) {}
};

// A value of any type. The alternatives are in the order of the scalar types; a scalar is a list
// of one. Booleans are 0 or 1.
using Elements =
    std::variant<List<std::uint8_t>, List<double>, List<std::int32_t>, List<std::int64_t>,
                 List<std::string>, List<std::uint32_t>, List<std::uint64_t>>;

// No elements, of the alternative that belongs to a scalar or array type.
Elements noElements(DataType type);
DataType elementType(const Elements& elements);
std::size_t elementCount(const Elements& elements);
// The element at an index as a value of its own.
Elements elementAt(const Elements& elements, std::size_t index);
// Adds elements of the same alternative.
void append(Elements& target, const Elements& more);

// Numbers as texts, the same in every locale.
std::string numberText(double number);
// The first element as text, for messages.
std::string firstText(const Elements& elements);

}  // namespace simulator
