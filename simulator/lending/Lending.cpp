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

// Takes back memory, and frees it after its last use. Returns whether it was lent as such an item.
bool takeBack(void* memory, Ledger::Item item) noexcept {
    const Ledger::Return outcome = Ledger::instance().takeBack(memory, item);
    if (outcome == Ledger::Return::Unused) {
        std::free(memory);
    }
    return outcome != Ledger::Return::NotLent;
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
    if (!takeBack(text, Ledger::Item::Text)) {
        reportMisuse("freeString", "a text");
    }
}

void takeBackNumbers(void* array) noexcept {
    if (array == nullptr || takeBack(array, Ledger::Item::Numbers)) {
        return;
    }
    if (Ledger::instance().has(array)) {
        reportMisuse("freeArray", "an array of numbers");
    } else {
        std::free(array);
    }
}

void takeBackTexts(char** array) noexcept {
    if (array == nullptr) {
        return;
    }
    if (!takeBack(array, Ledger::Item::Texts)) {
        reportMisuse("freeStringArray", "an array of texts");
    }
}

}  // namespace simulator
