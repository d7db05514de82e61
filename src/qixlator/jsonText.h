#pragma once

#include "qihtl/String.h"

// What the translator reads from JSON texts, on top of jsonz.
namespace qixlator {

// Appends the string value at `position`, its escapes resolved. Nothing when there is no string;
// what stands before a faulty escape.
void appendJsonString(const char* position, qihtl::String* output, qierr_Status* status);

// Appends the JSON text of the value at `position`: all that follows when it does not end.
void appendJsonText(const char* position, qihtl::String* output, qierr_Status* status);

}  // namespace qixlator
