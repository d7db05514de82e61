#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace simulator {

// Copies of texts for a caller, who owns them and gives them back to the driver. All of them come
// from malloc. These throw std::bad_alloc and lend nothing then.
char* lendText(const std::string& text);
// An empty list is lent as null.
char** lendTexts(const std::vector<std::string>& texts);

void takeBackTexts(char** array, uint32_t count) noexcept;

}  // namespace simulator
