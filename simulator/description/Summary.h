#pragma once

#include <string>

#include "model/Chassis.h"

namespace simulator {

// What is where, in lines for people to read: the devices, what stands in which slot, the channels
// and the NVMEM areas.
std::string summaryOf(const Chassis& chassis);

}  // namespace simulator
