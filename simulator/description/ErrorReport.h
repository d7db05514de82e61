#pragma once

#include <string>

#include "description/Description.h"

namespace simulator {

// Says on standard error, in one line, what is wrong with a file.
void reportError(const std::string& source, const DescriptionError& fault);

// Says on standard error, in one line, why the simulator cannot start, and throws a Refusal with
// chassisNotLoaded. source: the file, or the environment variable, that is not as it should be.
[[noreturn]] void refuseStart(const std::string& source, const DescriptionError& fault);

}  // namespace simulator
