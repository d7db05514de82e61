#pragma once

#include "qihtl/String.h"

// The variables that may stand in the paths of a translator's settings.
namespace qixlatorlua {

// Replaces `value` by the value of the variable: "" when there is none of this name.
void lookupVariable(const char* name, qihtl::String* value, qierr_Status* status);

// Replaces `expanded` by the path with each variable replaced by its value. A variable begins with
// "$" and ends before a slash; without that slash the path is invalid (qiapalerr_invalidParameter),
// and so is one whose variables hold variables without an end.
void expandPath(const char* path, qihtl::String* expanded, qierr_Status* status);

}  // namespace qixlatorlua
