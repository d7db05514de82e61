#pragma once

#include <string>

#include "qitrmcwebsvc/Json.h"

namespace nQITRMCWEBSVC100 {

// A value as JSON text without blanks. JSON has no infinities and no NaN, but a driver may measure
// one: each is printed as null.
std::string compactJson(const JsonValue& value);

}  // namespace nQITRMCWEBSVC100
