#pragma once

#include <qierr_status.h>

#include <cstdint>

#include "qierr/SourcePosition.h"
#include "qierr/codes.h"

// Operations on the failure record. None throws; a record is used by one thread at a time.
//
// Precedence: an error stands against every later code; a warning gives way to an error only; a
// success gives way to anything but another success.

// Sets the code if precedence allows it; an existing text is then reset to "{}". Returns non-zero
// if the code was replaced.
int qierr_Status_setCode(qierr_Status* status, std::int32_t code);

// The same, and on replacement writes file, line and component into a fresh text. *textWritten, if
// given, becomes false when the text could not be written; the code stands all the same.
int qierr_Status_setCodeAt(qierr_Status* status, std::int32_t code,
                           const qierr_SourcePosition& position, bool* textWritten = nullptr);

// The same, and writes error_constant before the position.
int qierr_Status_setCodeNamed(qierr_Status* status, std::int32_t code,
                              const qierr_SourcePosition& position, bool* textWritten = nullptr);

// Merges source into target by precedence. On replacement the text moves when both use the same
// reallocJson, and is copied otherwise. The code of source is left as it was.
int qierr_Status_take(qierr_Status* target, qierr_Status* source, bool* textWritten = nullptr);

// Merges source into target by precedence, always copying, and only if source has text.
int qierr_Status_merge(qierr_Status* target, const qierr_Status* source,
                       bool* textWritten = nullptr);

// Makes target a copy of source whatever its code is. Returns non-zero on success; on failure
// target keeps its code and text.
int qierr_Status_assign(qierr_Status* target, const qierr_Status* source);

// The reallocJson of every record that this program makes: a malloc'ed buffer of at least 512 bytes
// that grows in powers of two.
std::int32_t qierr_Status_defaultRealloc(qierr_Status* status, std::uint32_t size);

namespace qierr {

// The record with a life cycle: starts as success, frees its text at the end. Layout as the plain
// record's.
struct Status : qierr_Status {
    Status() noexcept;
    ~Status();
    Status(const Status&) = delete;
    Status& operator=(const Status&) = delete;
};

}  // namespace qierr
