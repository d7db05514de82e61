#pragma once

#include <cstdint>
#include <string>
#include <vector>

// Describes what is wrong with the text of a JSON-RPC response; "" when nothing is. A valid text is
// one JSON value, which is a response object or a non-empty array of them; each has exactly the
// members of its kind, in the order in which the service sends them.
std::string responseFault(const std::string& text);

// The outcomes in a valid text, in order: 0 for a result, else the most precise code.
std::vector<std::int32_t> outcomesIn(const std::string& text);
