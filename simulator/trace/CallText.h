#pragma once

#include <string>

#include "trace/Call.h"

namespace simulator {

// A call as one line of text: the function with what it was given, then the outcome: the status
// code, the details of a failure or warning, and what a success gave out. Long values are cut.
std::string callText(const Call& call, const qierr_Status& status);

}  // namespace simulator
