#include "qitrmcwebsvc/procedure/jsonValues.h"

#include <qitrmcapi.h>

#include <new>

namespace nQITRMCWEBSVC100 {

JsonValue textValue(std::string_view text, JsonPool& pool) {
    return JsonValue(text.data(), static_cast<rapidjson::SizeType>(text.size()), pool);
}

void reserveElements(JsonValue& array, std::size_t count, JsonPool& pool) {
    // The JSON library multiplies without a look at the result.
    if (count > PTRDIFF_MAX / sizeof(JsonValue))
        throw std::bad_alloc();
    array.Reserve(static_cast<rapidjson::SizeType>(count), pool);
}

JsonValue enumItemValue(const char* enumeration, std::int32_t value, JsonPool& pool) {
    return textValue(nQITRMCAPI100_translateStaticEnumValueToString(enumeration, value), pool);
}

}  // namespace nQITRMCWEBSVC100
