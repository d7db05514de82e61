#include "model/Values.h"

#include <array>
#include <charconv>

namespace simulator {

namespace {

constexpr std::int32_t scalarTypes = 7;
constexpr std::array<const char*, scalarTypes> scalarNames{"Bool",   "Double", "Int32", "Int64",
                                                           "String", "UInt32", "UInt64"};

DataType fromNumber(std::int32_t number) {
    return static_cast<DataType>(number);
}
std::int32_t toNumber(DataType type) {
    return static_cast<std::int32_t>(type);
}

std::string textOf(double number) {
    return numberText(number);
}
std::string textOf(const std::string& text) {
    return text;
}
template <typename Integer>
std::string textOf(Integer number) {
    return std::to_string(number);
}

}  // namespace

bool isArray(DataType type) {
    return toNumber(type) > scalarTypes;
}

DataType elementType(DataType type) {
    return isArray(type) ? fromNumber(toNumber(type) - scalarTypes) : type;
}

DataType arrayType(DataType type) {
    return isArray(type) ? type : fromNumber(toNumber(type) + scalarTypes);
}

std::string typeName(DataType type) {
    const auto index = static_cast<std::size_t>(toNumber(elementType(type)) - 1);
    return std::string(scalarNames[index]) + (isArray(type) ? "Array" : "");
}

std::optional<DataType> typeNamed(std::string_view name) {
    for (std::int32_t number = 1; number <= 2 * scalarTypes; ++number) {
        if (typeName(fromNumber(number)) == name) {
            return fromNumber(number);
        }
    }
    return std::nullopt;
}

Elements noElements(DataType type) {
    switch (elementType(type)) {
        case DataType::Boolean:
            return List<std::uint8_t>();
        case DataType::Real:
            return List<double>();
        case DataType::Int32:
            return List<std::int32_t>();
        case DataType::Int64:
            return List<std::int64_t>();
        case DataType::Uint32:
            return List<std::uint32_t>();
        case DataType::Uint64:
            return List<std::uint64_t>();
        default:
            return List<std::string>();
    }
}

DataType elementType(const Elements& elements) {
    return fromNumber(static_cast<std::int32_t>(elements.index()) + 1);
}

std::size_t elementCount(const Elements& elements) {
    return std::visit([](const auto& list) { return list.size(); }, elements);
}

Elements elementAt(const Elements& elements, std::size_t index) {
    return std::visit(
        [&](const auto& list) -> Elements { return std::decay_t<decltype(list)>{list[index]}; },
        elements);
}

void append(Elements& target, const Elements& more) {
    std::visit(
        [&](auto& list) {
            const auto& added = std::get<std::decay_t<decltype(list)>>(more);
            list.insert(list.end(), added.begin(), added.end());
        },
        target);
}

std::string numberText(double number) {
    std::array<char, 64> digits;
    const auto [end, error] = std::to_chars(digits.data(), digits.data() + digits.size(), number);
    return error == std::errc() ? std::string(digits.data(), end) : std::string();
}

std::string firstText(const Elements& elements) {
    return std::visit(
        [](const auto& list) { return list.empty() ? std::string() : textOf(list.front()); },
        elements);
}

}  // namespace simulator
