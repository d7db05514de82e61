#pragma once

#include "common/digits.h"
#include "jsonz/jsonz.h"

// Functions that read single tokens and containers, shared by the sources of this folder.
namespace jsonz {

const char* skipWhiteSpace(const char* position);

using common::hexDigit;
using common::isDigit;

// Reads a string, number or keyword at `position`, which must not be white space. Always fills
// `value`; returns the position after the token, or null.
const char* readScalar(const char* position, jsonz_value* value);
const char* readString(const char* position, jsonz_value* value);

// Fills `value` with a failure; returns null.
const char* fail(jsonz_value* value, const char* position, jsonz_error error);

// The same for the container whose opening bracket is at `position`.
const char* readContainer(const char* position, jsonz_value* value);

}  // namespace jsonz
