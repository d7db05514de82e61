#pragma once

#include <string_view>

#include "sessions/Simulator.h"

namespace simulator {

// One attribute of an open property. `type` is the data type in the name of the driver's
// function. Refuses with unknownAttribute. A text that the property does not have is empty.
Elements attribute(const Simulator& simulator, const OpenProperty& property, std::string_view name,
                   DataType type);

// A text attribute of a command.
const std::string& attribute(const Command& command, std::string_view name);

}  // namespace simulator
