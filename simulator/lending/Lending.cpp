#include "lending/Lending.h"

#include <cstdio>
#include <new>

#include "lending/Ledger.h"

namespace simulator {

namespace {

void reportMisuse(const char* function, const char* item) noexcept {
    std::fprintf(stderr,
                 "qitrmcapi: nQITRMCAPI100_%s was given what is not %s that is lent; it was left "
                 "alone. Give each thing back once, through the function of its kind.\n",
                 function, item);
}

}  // namespace

void* lendMemory(std::size_t size, Ledger::Item item) {
    void* memory = std::malloc(size);
    if (memory == nullptr) {
        throw std::bad_alloc();
    }
    try {
        Ledger::instance().lend(memory, item);
    } catch (...) {
        std::free(memory);
        throw;
    }
    return memory;
}

char* lendText(const std::string& text) {
    auto* copy = static_cast<char*>(lendMemory(text.size() + 1, Ledger::Item::Text));
    std::memcpy(copy, text.c_str(), text.size() + 1);
    return copy;
}

void takeBackText(char* text) noexcept {
    if (text == nullptr) {
        return;
    }
    if (Ledger::instance().takeBack(text, Ledger::Item::Text)) {
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
    if (ledger.takeBack(array, Ledger::Item::Numbers) || !ledger.has(array)) {
        std::free(array);
    } else {
        reportMisuse("freeArray", "an array of numbers");
    }
}

void takeBackTexts(char** array) noexcept {
    if (array == nullptr) {
        return;
    }
    if (Ledger::instance().takeBack(array, Ledger::Item::Texts)) {
        std::free(array);
    } else {
        reportMisuse("freeStringArray", "an array of texts");
    }
}

}  // namespace simulator
