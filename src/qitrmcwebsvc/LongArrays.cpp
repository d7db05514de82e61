#include "qitrmcwebsvc/LongArrays.h"

#include <algorithm>
#include <cstdint>
#include <cstring>
#include <utility>

namespace nQITRMCWEBSVC100 {
namespace {

// A text at this address stands for an array. Its length is the number of the array.
constexpr char arrayMark[] = "array";

bool contains(const char* text, std::size_t length, char wanted) {
    return std::memchr(text, wanted, length) != nullptr;
}

// The length of the text in front of the closing bracket if the array is long and has only numbers
// and literals, otherwise 0. Without inner brackets and strings the next bracket is that of the
// array.
std::size_t flatLength(const char* text, const char* textEnd) {
    const void* const bracket = std::memchr(text, ']', static_cast<std::size_t>(textEnd - text));
    if (bracket == nullptr || static_cast<const char*>(bracket) - text < LongArrays::shortest) {
        return 0;
    }
    const auto length = static_cast<std::size_t>(static_cast<const char*>(bracket) - text);
    const bool isFlat = !contains(text, length, '[') && !contains(text, length, '{') &&
                        !contains(text, length, '"');
    return isFlat ? length : 0;
}

// The number of elements in a valid text, in which each has at least one byte.
rapidjson::SizeType countElements(const char* text, std::size_t length) {
    rapidjson::SizeType count = 1;
    for (std::size_t position = 0; position < length; ++position) {
        count += text[position] == ',' ? 1 : 0;
    }
    return std::min(count, static_cast<rapidjson::SizeType>(length / 2 + 1));
}

}  // namespace

bool LongArrays::beginFlat(const char* text, const char* textEnd) {
    const std::size_t length = flatLength(text, textEnd);
    if (length == 0) {
        return false;
    }
    arrays.emplace_back(rapidjson::kArrayType);
    arrays.back().Reserve(countElements(text, length), document.GetAllocator());
    open = true;
    return true;
}

bool LongArrays::add(JsonValue&& scalar) {
    arrays.back().PushBack(scalar, document.GetAllocator());
    return true;
}

bool LongArrays::finish() {
    open = false;
    return document.String(arrayMark, static_cast<rapidjson::SizeType>(arrays.size() - 1), false);
}

void LongArrays::placeIn(JsonValue& value) {
    if (value.IsString() && value.GetString() == arrayMark) {
        value = std::move(arrays[value.GetStringLength()]);
    } else if (value.IsArray()) {
        for (JsonValue& element : value.GetArray()) {
            placeIn(element);
        }
    } else if (value.IsObject()) {
        for (auto& member : value.GetObject()) {
            placeIn(member.value);
        }
    }
}

}  // namespace nQITRMCWEBSVC100
