#include "entries/Lending.h"

namespace simulator {

char* lendText(const std::string& text) {
    auto* copy = static_cast<char*>(std::malloc(text.size() + 1));
    if (copy == nullptr) {
        throw std::bad_alloc();
    }
    std::memcpy(copy, text.c_str(), text.size() + 1);
    return copy;
}

char** lendTexts(const std::vector<std::string>& texts) {
    if (texts.empty()) {
        return nullptr;
    }
    auto** array = static_cast<char**>(std::malloc(texts.size() * sizeof(char*)));
    if (array == nullptr) {
        throw std::bad_alloc();
    }
    uint32_t lent = 0;
    try {
        for (; lent < texts.size(); ++lent) {
            array[lent] = lendText(texts[lent]);
        }
    } catch (...) {
        takeBackTexts(array, lent);
        throw;
    }
    return array;
}

void takeBackTexts(char** array, uint32_t count) noexcept {
    for (uint32_t i = 0; i < count; ++i) {
        std::free(array[i]);
    }
    std::free(array);
}

}  // namespace simulator
