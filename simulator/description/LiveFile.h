#pragma once

#include "description/Description.h"
#include "model/Chassis.h"

namespace simulator {

// Reads how properties move: the members "live" of devices and their channels. All devices of the
// description have been read into the chassis before. Throws DescriptionFault.
void readLife(const Node& root, Chassis& chassis);

}  // namespace simulator
