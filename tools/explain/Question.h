#pragma once

#include <cstdint>
#include <string>

#include "explain/Options.h"

namespace explain {

class Translator;

// A status to explain.
struct Question {
    std::int32_t code = 0;
    std::string details;  // a JSON object, or empty
};

// The status that the operands name. Throws UsageError, and for an unknown name a Failure that
// lists similar names with their texts.
Question readQuestion(const Options& options, Translator& translator);

}  // namespace explain
