#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace simulator {

// The one of the known names that may have been meant, or null when none is like the given one.
// Letter case does not count.
const std::string* nearestName(std::string_view given, const std::vector<std::string>& known);

// Says which of the known names may have been meant, as 'perhaps "devices" is meant; ', or nothing.
std::string perhapsMeant(std::string_view given, const std::vector<std::string>& known);

}  // namespace simulator
