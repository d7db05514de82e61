#pragma once

#include <string>

#include "trace/Call.h"

namespace simulator {

// A call as one line of text: the function with its inputs, then the outcome: the status code, the
// details of a failure or warning, and the outputs of a success. Long values are truncated.
std::string callText(const Call& call, const qierr_Status& status);

}  // namespace simulator
