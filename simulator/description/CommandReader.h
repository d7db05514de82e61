#pragma once

#include <string>

#include "description/Description.h"
#include "model/Chassis.h"

namespace simulator {

// Reads a command of a resource whose properties, and those of its device, have been read. Throws
// DescriptionError.
Command readCommand(const std::string& name, const Node& node, const Resource& resource,
                    const Enumerations& enumerations);

}  // namespace simulator
