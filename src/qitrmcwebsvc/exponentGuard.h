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

}  // namespace nQITRMCWEBSVC100
