#pragma once

#include "qierr/Status.h"

// Dynamic loading with failures reported in a status. Both functions return null and do nothing if
// the status is already negative. On failure they set qiapalerr_invalidParameter with the text of
// dlerror() as a detail, and return null.

// Opens a library by path or name with RTLD_NOW and RTLD_GLOBAL. The caller closes the handle with
// dlclose.
void* qidynlib_load(const char* path, qierr_Status* status);

// The address of a symbol of the library.
void* qidynlib_symbol(void* handle, const char* name, qierr_Status* status);
