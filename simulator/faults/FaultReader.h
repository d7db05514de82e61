#pragma once

#include <string_view>

#include "faults/FaultPlan.h"

namespace simulator {

// Reads a description of faults, whose names are those of a chassis. Throws DescriptionError.
FaultPlan readFaults(std::string_view text, const Chassis& chassis);

}  // namespace simulator
