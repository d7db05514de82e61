#pragma once

#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <string>
#include <string_view>
#include <vector>

#include "lending/Ledger.h"

namespace simulator {

// Copies of texts and numbers for a caller, who owns them and returns them to the driver. All of
// them come from malloc and are in the ledger. These throw std::bad_alloc and lend nothing then.
char* lendText(const std::string& text);
// Lends an array of `count` texts, or null for none. textAt(index) returns a std::string_view,
// which is valid until the next call; one whose data is null becomes a null pointer. It is called
// twice for each index. The array and its texts are one block of memory.
template <typename TextAt>
char** lendTexts(std::size_t count, TextAt textAt);

// Memory that is lent as an item of this kind. size is in bytes and not 0.
void* lendMemory(std::size_t size, Ledger::Item item);

template <typename Number>
Number* lendNumbers(const std::vector<Number>& numbers) {
    if (numbers.empty()) {
        return nullptr;
    }
    const std::size_t size = numbers.size() * sizeof(Number);
    void* array = lendMemory(size, Ledger::Item::Numbers);
    std::memcpy(array, numbers.data(), size);
    return static_cast<Number*>(array);
}

template <typename TextAt>
char** lendTexts(std::size_t count, TextAt textAt) {
    if (count == 0) {
        return nullptr;
    }
    std::size_t size = count * sizeof(char*);
    for (std::size_t i = 0; i < count; ++i) {
        const std::string_view text = textAt(i);
        size += text.data() == nullptr ? 0 : text.size() + 1;
    }
    auto** array = static_cast<char**>(lendMemory(size, Ledger::Item::Texts));
    char* next = reinterpret_cast<char*>(array + count);
    for (std::size_t i = 0; i < count; ++i) {
        const std::string_view text = textAt(i);
        array[i] = text.data() == nullptr ? nullptr : next;
        if (array[i] != nullptr) {
            std::memcpy(next, text.data(), text.size());
            next[text.size()] = '\0';
            next += text.size() + 1;
        }
    }
    return array;
}

// Free what was lent; null is allowed. What was not lent as such an item is not touched, with a
// line on standard error; but an array of numbers that is not in the ledger was allocated by its
// owner with malloc, and is freed.
void takeBackText(char* text) noexcept;
void takeBackNumbers(void* array) noexcept;
void takeBackTexts(char** array) noexcept;

}  // namespace simulator
