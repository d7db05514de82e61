#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "entries/Entry.h"
#include "lending/Lending.h"
#include "model/Values.h"
#include "sessions/ReadValue.h"

// Conversion between the C types of the driver's functions and values. A text is a pointer in C,
// and a Boolean the only number of 8 bits.
namespace simulator {

constexpr DataType typeOf(std::uint8_t) {
    return DataType::Boolean;
}
constexpr DataType typeOf(double) {
    return DataType::Real;
}
constexpr DataType typeOf(std::int32_t) {
    return DataType::Int32;
}
constexpr DataType typeOf(std::int64_t) {
    return DataType::Int64;
}
constexpr DataType typeOf(const char*) {
    return DataType::Text;
}
constexpr DataType typeOf(std::uint32_t) {
    return DataType::Uint32;
}
constexpr DataType typeOf(std::uint64_t) {
    return DataType::Uint64;
}

template <typename Number>
void lendScalar(const ReadValue& read, Number* value) {
    *value = std::get<List<Number>>(read.elements()).front();
}

inline void lendScalar(const ReadValue& read, char** value) {
    *value = lendText(std::get<List<std::string>>(read.elements()).front());
}

template <typename Number>
void lendArray(const ReadValue& read, Number** array, std::uint32_t* count) {
    const auto& list = std::get<List<Number>>(read.elements());
    *array = lendNumbers(list);
    *count = static_cast<std::uint32_t>(list.size());
}

template <typename Text>
void lendList(const std::vector<Text>& list, char*** array, std::uint32_t* count) {
    *array =
        lendTexts(list.size(), [&](std::size_t index) { return std::string_view(list[index]); });
    *count = static_cast<std::uint32_t>(list.size());
}

inline void lendArray(const ReadValue& read, char*** array, std::uint32_t* count) {
    if (const SharedTexts* shared = read.sharedNames()) {
        *array = shared->lend();
        *count = shared->count();
    } else if (const ReadValue::Names* names = read.names()) {
        lendList(*names, array, count);
    } else {
        lendList(std::get<List<std::string>>(read.elements()), array, count);
    }
}

template <typename Number>
Number asElement(Number value) {
    return value;
}

inline std::uint8_t asElement(std::uint8_t value) {
    return value != 0 ? 1 : 0;
}

inline std::string asElement(const char* value) {
    return std::string(required(value, "value"));
}

template <typename Value>
Elements asElements(Value value) {
    return List<decltype(asElement(value))>{asElement(value)};
}

template <typename Value>
Elements asElements(const Value* array, std::uint32_t count) {
    if (array == nullptr && count != 0) {
        throw Refusal(code::missingArgument).usage(tag::argument, "array");
    }
    List<decltype(asElement(*array))> list;
    list.reserve(count);
    for (std::uint32_t i = 0; i < count; ++i) {
        list.push_back(asElement(array[i]));
    }
    return list;
}

}  // namespace simulator
