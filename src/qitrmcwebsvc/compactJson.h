#pragma once

#include <cstdint>
#include <string>

#include "qitrmcwebsvc/Json.h"

namespace nQITRMCWEBSVC100 {

// A value as JSON text without blanks. An infinity or NaN, which a driver may return but JSON
// cannot represent, is printed as null.
std::string compactJson(const JsonValue& value);

// A value that compactJson prints as an array of these bytes as numbers, and that nothing else can
// read. It takes a sixteenth of the memory of an array with a value for each byte, and much less
// time. Throws std::bad_alloc if there is not enough memory.
JsonValue byteArray(const std::uint8_t* bytes, std::uint32_t count, JsonAllocator& allocator);

}  // namespace nQITRMCWEBSVC100
