#pragma once

#include <cstddef>
#include <cstdint>
#include <iterator>
#include <string_view>

#include "qitrmcwebsvc/Json.h"

namespace nQITRMCWEBSVC100 {

// Functions that build results with the allocator of a response. They throw std::bad_alloc on
// failure.

// A copy of a text.
JsonValue textValue(std::string_view text, JsonAllocator& allocator);

// Reserves room for `count` elements, so that filling the array allocates only once.
void reserveElements(JsonValue& array, std::size_t count, JsonAllocator& allocator);

// Appends a null to an array with room for it, and returns the element for the caller to set. For a
// long array of numbers this takes a third of the time of moving complete values into the array.
inline JsonValue& appendElement(JsonValue& array, JsonAllocator& allocator) {
    array.PushBack(JsonValue(), allocator);
    return *(array.End() - 1);
}

// Appends copies of a range of texts.
template <typename Texts>
void appendTexts(JsonValue& array, const Texts& texts, JsonAllocator& allocator) {
    const auto added = static_cast<std::size_t>(std::distance(texts.begin(), texts.end()));
    reserveElements(array, array.Size() + added, allocator);
    for (const auto& text : texts) {
        array.PushBack(textValue(text, allocator), allocator);
    }
}

// The name of an enumeration's value as clients see it.
JsonValue enumItemValue(const char* enumeration, std::int32_t value, JsonAllocator& allocator);

}  // namespace nQITRMCWEBSVC100
