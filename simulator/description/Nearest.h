#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace simulator {

// Says which of the known names may have been meant, as 'perhaps "devices" is meant; ', or nothing
// when none is like the given one. Letter case does not count.
std::string perhapsMeant(std::string_view given, const std::vector<std::string>& known);

}  // namespace simulator
