#pragma once

#include <optional>
#include <string>

namespace nQITRMCWEBSVC100 {

// The JSON reader adds up the exponent of a number and the places behind its point in 32 bits
// without a check, so that 0.1e-2147483647 overflows. No value has that many digits in front of
// such an exponent, so it is zero in any case: the exponent can be made smaller without changing
// what any text means.
//
// Returns the text with every such exponent lowered, at its old length so that offsets stay true,
// or nothing when the text holds none. Cost is linear.
std::optional<std::string> withSafeExponents(const char* text);

// Whether a text holds a number of more than 200 million digits in a row, outside its strings: the
// reader counts digits in 32 bits too, and with some 215 million of them behind a point a positive
// exponent overflows.
bool holdsUncountableNumber(const std::string& text);

}  // namespace nQITRMCWEBSVC100
