#pragma once

#include "qihtl/String.h"

// Copying of values from JSON texts that are read with jsonz.
namespace qixlator {

// Appends the string value at `position` with its escapes resolved, up to an invalid escape.
// Appends nothing if there is no string.
void appendJsonString(const char* position, qihtl::String* output, qierr_Status* status);

// Appends the JSON text of the value at `position`. If the value is incomplete, appends the rest of
// the text.
void appendJsonText(const char* position, qihtl::String* output, qierr_Status* status);

}  // namespace qixlator
