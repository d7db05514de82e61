#pragma once

#include "description/Description.h"
#include "live/Motions.h"
#include "model/Chassis.h"

namespace simulator {

// Reads how properties move: the members "live" of devices and their channels. All devices of the
// description have been read into the chassis before. Throws DescriptionError.
void readMotions(const Node& root, const Chassis& chassis, Motions& motions);

}  // namespace simulator
