#pragma once

#include "qierr/SourcePosition.h"

namespace nQITRMCWEBSVC100 {

// Throws BasicError invalidParams with the sentence of this name (see getErrorDescription).
[[noreturn]] void throwInvalidParams(const char* descriptionName,
                                     const qierr_SourcePosition& position);

}  // namespace nQITRMCWEBSVC100
