#pragma once

#include <string>

#include "model/Chassis.h"

namespace simulator {

// The devices, the modules in their slots, the channels and the NVMEM areas, as lines for people to
// read.
std::string summaryOf(const Chassis& chassis);

}  // namespace simulator
