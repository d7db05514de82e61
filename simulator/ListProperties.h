#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "Simulator.h"

namespace simulator {

// Properties that hold lists which the simulator keeps itself. They refuse with unknownProperty.
std::vector<std::string> systemList(const Simulator& simulator, std::string_view property);
std::vector<std::string> sessionList(const Simulator& simulator, const Session& session,
                                     std::string_view property);
std::vector<std::string> resourceList(const Resource& resource, std::string_view property);

}  // namespace simulator
