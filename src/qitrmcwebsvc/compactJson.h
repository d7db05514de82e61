#pragma once

#include <string>

#include "qitrmcwebsvc/Json.h"

namespace nQITRMCWEBSVC100 {

// A value as JSON text without blanks. An infinity or NaN, which a driver may return but JSON
// cannot represent, is printed as null.
std::string compactJson(const JsonValue& value);

}  // namespace nQITRMCWEBSVC100
