#include <cstdlib>
#include <new>

#include "support/FaultyAllocator.h"

void* operator new(std::size_t size) {
    void* const block = FaultyAllocator::nextFails() ? nullptr : std::malloc(size == 0 ? 1 : size);
    if (block == nullptr) {
        throw std::bad_alloc();
    }
    return block;
}

void operator delete(void* block) noexcept {
    std::free(block);
}

void operator delete(void* block, std::size_t) noexcept {
    std::free(block);
}
