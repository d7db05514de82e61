#pragma once

#include <cstdint>

#include "qierr/Writer.h"

namespace qixlator {

// Sets the code and opens the object `qixlator_debug` in the status's text, for the notes of the
// caller. When an earlier error stands, nothing is set and the writer does nothing.
qierr_Writer reportFailure(qierr_Status* status, std::int32_t code,
                           const qierr_SourcePosition& position);

}  // namespace qixlator
