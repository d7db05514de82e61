// Folder qierr: the status record of a failure, the writer of its JSON text, and exceptions with
// it.
#pragma once

#include <qierr_status.h>

#include <cstdint>

#include "qierr/SourcePosition.h"
#include "qierr/codes.h"

// Operations on the status record. No function throws; a record may be used by one thread at a
// time.
//
// Precedence: an error is never replaced; a warning is replaced by an error only; a success is
// replaced by a warning or an error.

// Sets the code if precedence allows it, and then resets an existing text to "{}". Returns non-zero
// if the code was replaced.
int qierr_Status_setCode(qierr_Status* status, std::int32_t code);

// The same, and on replacement writes a new text with file, line and component. If `textWritten` is
// given, *textWritten is set to false when the text could not be written; the code is set anyway.
int qierr_Status_setCodeAt(qierr_Status* status, std::int32_t code,
                           const qierr_SourcePosition& position, bool* textWritten = nullptr);

// The same, and writes error_constant before the position.
int qierr_Status_setCodeNamed(qierr_Status* status, std::int32_t code,
                              const qierr_SourcePosition& position, bool* textWritten = nullptr);

// Merges source into target by precedence. On replacement the text is moved if both use the same
// reallocJson, and copied otherwise. The code of source does not change.
int qierr_Status_take(qierr_Status* target, qierr_Status* source, bool* textWritten = nullptr);

// Merges source into target by precedence, but only if source has a text, which is copied.
int qierr_Status_merge(qierr_Status* target, const qierr_Status* source,
                       bool* textWritten = nullptr);

// Makes target a copy of source regardless of precedence. Returns non-zero on success; on failure
// target keeps its code and text.
int qierr_Status_assign(qierr_Status* target, const qierr_Status* source);

// The reallocJson of every record that this program creates. It allocates with malloc: at least 512
// bytes, growing in powers of two.
std::int32_t qierr_Status_defaultRealloc(qierr_Status* status, std::uint32_t size);

namespace qierr {

// A record with a constructor (code 0, no text) and a destructor (frees the text). The layout is
// that of qierr_Status.
struct Status : qierr_Status {
    Status() noexcept;
    ~Status();
    Status(const Status&) = delete;
    Status& operator=(const Status&) = delete;
};

}  // namespace qierr
