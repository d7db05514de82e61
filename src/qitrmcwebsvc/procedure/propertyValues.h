#pragma once

#include <cstdint>

#include "qitrmcwebsvc/Json.h"
#include "qitrmcwebsvc/SessionProperty.h"

namespace nQITRMCWEBSVC100 {

// The conversion between the values of one property data type and JSON. Integers keep their sign
// and all their bits; a text that is written ends at its first NUL.
struct PropertyValueType {
    std::int32_t dataType;
    // Whether a value of a request has the type. A number with a fraction or an exponent is not an
    // integer, and an integer must be in the range of the type.
    bool (*accepts)(const JsonValue& value);
    JsonValue (*read)(const SessionProperty& property, JsonAllocator& allocator);
    // Writes a value for which `accepts` returns true.
    void (*write)(SessionProperty& property, const JsonValue& value);
};

// The conversion for a data type, or null if there is no such type.
const PropertyValueType* propertyValueType(std::int32_t dataType);

}  // namespace nQITRMCWEBSVC100
