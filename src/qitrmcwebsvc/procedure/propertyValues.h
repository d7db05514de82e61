#pragma once

#include <cstdint>

#include "qitrmcwebsvc/Json.h"
#include "qitrmcwebsvc/SessionProperty.h"

namespace nQITRMCWEBSVC100 {

// How the values of one data type of properties appear in JSON. Integers keep their sign and all
// their bits; a text that is written ends at its first NUL.
struct PropertyValueType {
    std::int32_t dataType;
    // Whether a value of a request is of the type: a literal with a fraction or an exponent is no
    // integer, and an integer must be in the range of the type.
    bool (*accepts)(const JsonValue& value);
    JsonValue (*read)(const SessionProperty& property, JsonPool& pool);
    // Writes a value that the type accepts.
    void (*write)(SessionProperty& property, const JsonValue& value);
};

// The row of a data type, or null for a number that is none.
const PropertyValueType* propertyValueType(std::int32_t dataType);

}  // namespace nQITRMCWEBSVC100
