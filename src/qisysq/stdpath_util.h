#pragma once

#include <cstdint>

#include "qierr/Writer.h"
#include "qihtl/String.h"

// Helpers for the path functions and for reports of operating system failures.

// Adds an object `internal_error` for an errno value, with its number and, if there is one, its
// text.
qierr_Writer qisysq_addErrno(qierr_Writer writer, std::int32_t error);

namespace qisysq {

// Reads a whole file into `buffer`. qiapalerr_resourceNotFound if it cannot be opened,
// qiapalerr_osFault if it cannot be read to its end, qiapalerr_memoryFull if memory runs out. Does
// nothing if the status is already negative.
void readFileToBuffer(const char* fileName, qihtl::String* buffer, qierr_Status* status);

}  // namespace qisysq
