#pragma once

#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <new>
#include <string>
#include <vector>

namespace simulator {

// Copies of texts and numbers for a caller, who owns them and gives them back to the driver. All of
// them come from malloc. These throw std::bad_alloc and lend nothing then.
char* lendText(const std::string& text);
// An empty list is lent as null.
char** lendTexts(const std::vector<std::string>& texts);
template <typename Number>
Number* lendNumbers(const std::vector<Number>& numbers) {
    if (numbers.empty()) {
        return nullptr;
    }
    const size_t size = numbers.size() * sizeof(Number);
    auto* array = static_cast<Number*>(std::malloc(size));
    if (array == nullptr) {
        throw std::bad_alloc();
    }
    std::memcpy(array, numbers.data(), size);
    return array;
}

void takeBackTexts(char** array, uint32_t count) noexcept;

}  // namespace simulator
