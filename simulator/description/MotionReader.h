#pragma once

#include <string>

#include "description/Description.h"
#include "live/Motion.h"
#include "model/Chassis.h"

namespace simulator {

// The resource whose property moves, and the number of a channel, which replaces "{n}". The number
// is empty for a device, where "{n}" is not replaced.
struct MotionPlace {
    const Resource& resource;
    std::string number;
};

struct ReadMotion {
    Motion motion;
    // The resource of the properties that are followed; null when nothing is.
    const Resource* followed = nullptr;
};

// Reads how one property moves. The properties that it names must be in the chassis. Throws
// DescriptionError.
ReadMotion readMotion(const Node& node, const MotionPlace& place,
                      const PropertyDefinition& definition, const Chassis& chassis);

}  // namespace simulator
