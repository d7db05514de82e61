#pragma once

#include "qierr/Status.h"

// Dynamic loading that reports in a status. Both do nothing and return null when the status is
// already negative. On failure they set qiapalerr_invalidParameter with the loader's own words and
// return null.

// Opens a library by path or name, with all symbols bound at once and visible to libraries that are
// loaded later. The caller closes the handle with dlclose.
void* qidynlib_load(const char* path, qierr_Status* status);

// The address of a symbol of the library.
void* qidynlib_symbol(void* handle, const char* name, qierr_Status* status);
