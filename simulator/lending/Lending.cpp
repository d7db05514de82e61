#include "lending/Lending.h"

#include <cstdio>
#include <new>

#include "lending/Ledger.h"

namespace simulator {

namespace {

void* allocate(size_t size) {
    void* memory = std::malloc(size);
    if (memory == nullptr) {
        throw std::bad_alloc();
    }
    return memory;
}

void freeTexts(char** array, size_t count) noexcept {
    for (size_t i = 0; i < count; ++i) {
        std::free(array[i]);
    }
    std::free(array);
}

void reportMisuse(const char* function, const char* item) noexcept {
    std::fprintf(stderr,
                 "qitrmcapi: nQITRMCAPI100_%s was given what is not %s that is lent; it was left "
                 "alone. Give each thing back once, through the function of its kind.\n",
                 function, item);
}

}  // namespace

char* copyOf(std::string_view text) {
    auto* copy = static_cast<char*>(allocate(text.size() + 1));
    std::memcpy(copy, text.data(), text.size());
    copy[text.size()] = '\0';
    return copy;
}

char* lendText(const std::string& text) {
    char* copy = copyOf(text);
    try {
        Ledger::instance().lend(copy, Ledger::Item::text);
    } catch (...) {
        std::free(copy);
        throw;
    }
    return copy;
}

char** lendTexts(const std::vector<std::string>& texts) {
    return lendTexts(texts.size(), [&](size_t index) { return copyOf(texts[index]); });
}

char** lendTexts(size_t count, const std::function<char*(size_t)>& makeText) {
    if (count == 0) {
        return nullptr;
    }
    auto** array = static_cast<char**>(allocate(count * sizeof(char*)));
    size_t made = 0;
    try {
        for (; made < count; ++made) {
            array[made] = makeText(made);
        }
        Ledger::instance().lend(array, Ledger::Item::texts);
    } catch (...) {
        freeTexts(array, made);
        throw;
    }
    return array;
}

void* lendNumberMemory(size_t size) {
    void* array = allocate(size);
    try {
        Ledger::instance().lend(array, Ledger::Item::numbers);
    } catch (...) {
        std::free(array);
        throw;
    }
    return array;
}

void takeBackText(char* text) noexcept {
    if (text == nullptr) {
        return;
    }
    if (Ledger::instance().takeBack(text, Ledger::Item::text)) {
        std::free(text);
    } else {
        reportMisuse("freeString", "a text");
    }
}

void takeBackNumbers(void* array) noexcept {
    Ledger& ledger = Ledger::instance();
    if (array == nullptr) {
        return;
    }
    if (ledger.takeBack(array, Ledger::Item::numbers) || !ledger.has(array)) {
        std::free(array);
    } else {
        reportMisuse("freeArray", "an array of numbers");
    }
}

void takeBackTexts(char** array, uint32_t count) noexcept {
    if (array == nullptr) {
        return;
    }
    if (Ledger::instance().takeBack(array, Ledger::Item::texts)) {
        freeTexts(array, count);
    } else {
        reportMisuse("freeStringArray", "an array of texts");
    }
}

}  // namespace simulator
