#pragma once

#include <cstddef>
#include <string>
#include <string_view>

#include <rapidjson/error/error.h>

#include "description/Description.h"

namespace simulator {

// "line 2, column 15", both counted from 1 and columns in characters.
std::string lineAndColumn(std::string_view text, std::size_t offset);

// Says why a text is not JSON, for a person who wrote it by hand. `offset` is where the JSON
// library stopped with `code`, and `what` what the text should be.
DescriptionError syntaxError(std::string_view text, std::size_t offset,
                             rapidjson::ParseErrorCode code, const char* what);

}  // namespace simulator
