#pragma once

#include <optional>
#include <string>

namespace nQITRMCWEBSVC100 {

// The JSON reader adds the exponent of a number and the count of its decimal places in 32 bits
// without a check, so 0.1e-2147483647 overflows. A number with such an exponent is zero for any
// realistic count of digits, so its exponent can be reduced without changing the value.
//
// Returns the text with every such exponent reduced, or nothing if the text contains none. The
// length of the text does not change, so that offsets remain correct. The time is linear.
std::optional<std::string> withSafeExponents(const char* text);

// Whether a text contains, outside its strings, a number with more than 200 million consecutive
// digits. The reader counts digits in 32 bits too: with about 215 million decimal places a positive
// exponent overflows.
bool holdsUncountableNumber(const std::string& text);

}  // namespace nQITRMCWEBSVC100
