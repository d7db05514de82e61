#pragma once

#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <functional>
#include <string>
#include <string_view>
#include <vector>

namespace simulator {

// Copies of texts and numbers for a caller, who owns them and returns them to the driver. All of
// them come from malloc and are in the ledger. These throw std::bad_alloc and lend nothing then.
char* lendText(const std::string& text);
// An empty list is lent as null.
char** lendTexts(const std::vector<std::string>& texts);
// Lends an array of as many texts as count says; 0 is lent as null. makeText(index) makes them by
// copyOf(), or leaves one null.
char** lendTexts(size_t count, const std::function<char*(size_t)>& makeText);
char* copyOf(std::string_view text);

// Memory for an array of numbers that is lent. size is in bytes and not 0.
void* lendNumberMemory(size_t size);

template <typename Number>
Number* lendNumbers(const std::vector<Number>& numbers) {
    if (numbers.empty()) {
        return nullptr;
    }
    const size_t size = numbers.size() * sizeof(Number);
    void* array = lendNumberMemory(size);
    std::memcpy(array, numbers.data(), size);
    return static_cast<Number*>(array);
}

// Free what was lent; null is allowed. What was not lent as such an item is not touched, with a
// line on standard error; but an array of numbers that is not in the ledger was allocated by its
// owner with malloc, and is freed.
void takeBackText(char* text) noexcept;
void takeBackNumbers(void* array) noexcept;
void takeBackTexts(char** array, uint32_t count) noexcept;

}  // namespace simulator
