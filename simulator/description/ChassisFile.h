#pragma once

#include <memory>
#include <string_view>

#include "model/Chassis.h"

namespace simulator {

// Builds a chassis from the text of its description. Throws DescriptionFault.
std::unique_ptr<Chassis> parseChassis(std::string_view text);

// Reads the chassis that the environment names by QITRMC_SIM_CHASSIS, or the built-in one. A
// fault is told in one line on standard error, and thrown as a refusal with the file, the place in
// it, and what is wrong there.
std::unique_ptr<Chassis> loadChassis();

}  // namespace simulator
