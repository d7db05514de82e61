#pragma once

#include "description/Description.h"
#include "model/Chassis.h"

namespace simulator {

// Reads a block of registers of a device whose properties, parts and commands have been read.
// Throws DescriptionError.
void readRegisterBlock(const Node& node, const Chassis& chassis, Device& device);

}  // namespace simulator
