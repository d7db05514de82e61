#pragma once

#include "qihtl/String.h"

// Variables in the paths of a translator's settings.
namespace qixlatorlua {

// Replaces `value` by the value of the variable, or by "" if there is no such variable.
void lookupVariable(const char* name, qihtl::String* value, qierr_Status* status);

// Replaces `expanded` by the path with each variable replaced by its value. A variable begins with
// "$" and ends before a slash. A path is invalid (qiapalerr_invalidParameter) if that slash is
// missing or if the values of its variables contain variables recursively.
void expandPath(const char* path, qihtl::String* expanded, qierr_Status* status);

}  // namespace qixlatorlua
