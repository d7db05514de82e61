#include <cstddef>

#include "support/FaultyAllocator.h"

extern "C" {

void* __real_calloc(std::size_t count, std::size_t size);

void* __wrap_calloc(std::size_t count, std::size_t size) {
    return FaultyAllocator::nextFails() ? nullptr : __real_calloc(count, size);
}

}  // extern "C"
