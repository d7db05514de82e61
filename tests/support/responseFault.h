#pragma once

#include <cstdint>
#include <string>
#include <vector>

// What is wrong with the text of a JSON-RPC response, or "". Right is one JSON value, which is a
// response object or an array of at least one; each has exactly the members of its kind, in the
// order in which the service sends them.
std::string responseFault(const std::string& text);

// What the responses in a faultless text say, in order: 0 for a result, else the most precise code.
std::vector<std::int32_t> outcomesIn(const std::string& text);
