#pragma once

#include "qierr/SourcePosition.h"

namespace nQITRMCWEBSVC100 {

// Throws BasicError -32602 with the sentence of this name (getErrorDescription) for the client.
[[noreturn]] void throwInvalidParams(const char* descriptionName,
                                     const qierr_SourcePosition& position);

}  // namespace nQITRMCWEBSVC100
