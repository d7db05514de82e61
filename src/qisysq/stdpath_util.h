#pragma once

#include <cstdint>

#include "qierr/Writer.h"
#include "qihtl/String.h"

// Tools of the path functions and of those who report failures of the operating system.

// Adds the object `internal_error` for an errno: its number, and its text if it has one.
qierr_Writer qisysq_addErrno(qierr_Writer writer, std::int32_t error);

namespace qisysq {

// Reads a whole file. On success the buffer holds exactly its bytes, and a NUL behind them that
// does not count. A file that cannot be opened gives qiapalerr_resourceNotFound, one that cannot be
// read to its end qiapalerr_osFault, want of memory qiapalerr_memoryFull. Does nothing when the
// status is already negative.
void readFileToBuffer(const char* fileName, qihtl::String* buffer, qierr_Status* status);

}  // namespace qisysq
