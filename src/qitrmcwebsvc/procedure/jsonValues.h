#pragma once

#include <cstddef>
#include <cstdint>
#include <iterator>
#include <string_view>

#include "qitrmcwebsvc/Json.h"

namespace nQITRMCWEBSVC100 {

// Functions that build results in the pool of a response. They throw std::bad_alloc on failure.

// A copy of a text.
JsonValue textValue(std::string_view text, JsonPool& pool);

// Reserves room for `count` elements, so that filling the array allocates only once.
void reserveElements(JsonValue& array, std::size_t count, JsonPool& pool);

// Appends a null to an array with room for it, and returns the element for the caller to set. For a
// long array of numbers this takes a third of the time of moving complete values into the array.
inline JsonValue& appendElement(JsonValue& array, JsonPool& pool) {
    array.PushBack(JsonValue(), pool);
    return *(array.End() - 1);
}

// Appends copies of a range of texts.
template <typename Texts>
void appendTexts(JsonValue& array, const Texts& texts, JsonPool& pool) {
    const auto added = static_cast<std::size_t>(std::distance(texts.begin(), texts.end()));
    reserveElements(array, array.Size() + added, pool);
    for (const auto& text : texts)
        array.PushBack(textValue(text, pool), pool);
}

// The name of an enumeration's value as clients see it.
JsonValue enumItemValue(const char* enumeration, std::int32_t value, JsonPool& pool);

}  // namespace nQITRMCWEBSVC100
