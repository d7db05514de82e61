#pragma once

#include "description/Description.h"
#include "description/PropertyReader.h"
#include "status/Refusal.h"

namespace simulator {

// How deep causes may be nested in a described status.
inline constexpr int mostCauseDepth = 16;

// Reads a status that a description gives: its code, and either the details and causes or the
// whole text, unchanged. The enumerations are those that entries of the details may refer to.
// The refusal can be thrown; with a code above 0 it is a warning, to be reported when the call
// has done its work. Throws DescriptionError.
Refusal readStatus(const Node& node, const Enumerations& enumerations);

}  // namespace simulator
