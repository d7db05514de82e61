#pragma once

#include <cstdint>

#include "qierr/Writer.h"

namespace qixlator {

// Sets the code and begins the object `qixlator_debug` in the status's text. Returns a writer with
// which the caller adds details to that object. If the status already holds an error, the status is
// not changed and the writer does nothing.
qierr_Writer reportFailure(qierr_Status* status, std::int32_t code,
                           const qierr_SourcePosition& position);

}  // namespace qixlator
