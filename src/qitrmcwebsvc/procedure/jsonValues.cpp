#include "qitrmcwebsvc/procedure/jsonValues.h"

#include <qitrmcapi.h>

#include <algorithm>
#include <limits>
#include <new>

namespace nQITRMCWEBSVC100 {
namespace {

constexpr rapidjson::SizeType largestSize = std::numeric_limits<rapidjson::SizeType>::max();

}  // namespace

JsonValue textValue(std::string_view text, JsonAllocator& allocator) {
    // The JSON library stores sizes in 32 bits, including the NUL after a text.
    if (text.size() >= largestSize) {
        throw std::bad_alloc();
    }
    return JsonValue(text.data(), static_cast<rapidjson::SizeType>(text.size()), allocator);
}

void reserveElements(JsonValue& array, std::size_t count, JsonAllocator& allocator) {
    // The JSON library does not check this multiplication for overflow.
    constexpr std::size_t most =
        std::min<std::size_t>(largestSize, PTRDIFF_MAX / sizeof(JsonValue));
    if (count > most) {
        throw std::bad_alloc();
    }
    array.Reserve(static_cast<rapidjson::SizeType>(count), allocator);
}

JsonValue enumItemValue(const char* enumeration, std::int32_t value, JsonAllocator& allocator) {
    return textValue(nQITRMCAPI100_translateStaticEnumValueToString(enumeration, value), allocator);
}

}  // namespace nQITRMCWEBSVC100
