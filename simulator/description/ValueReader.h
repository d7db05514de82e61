#pragma once

#include "description/Description.h"
#include "model/Properties.h"

namespace simulator {

// Reads a value that the property may have. Items of an enumeration may be given by name.
Elements readValue(const PropertyDefinition& definition, const Node& node);

}  // namespace simulator
