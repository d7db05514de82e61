#pragma once

#include <memory>
#include <string_view>

#include "live/Motions.h"
#include "model/Chassis.h"

namespace simulator {

struct DescribedChassis {
    std::unique_ptr<Chassis> chassis;
    // How its properties move.
    Motions motions;
};

// Builds a chassis from the text of its description. Throws DescriptionError.
DescribedChassis parseChassis(std::string_view text);

// Reads the chassis that the environment names by QITRMC_SIM_CHASSIS, or the built-in one. An
// error is reported in one line on standard error, and thrown as a refusal with the file, the place
// in it, and what is wrong there.
DescribedChassis loadChassis();

}  // namespace simulator
