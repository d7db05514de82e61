#include "qitrmcwebsvc/ThrowingAllocator.h"

#include <cstdlib>
#include <new>

namespace nQITRMCWEBSVC100 {
namespace {

void* required(void* block) {
    if (!block)
        throw std::bad_alloc();
    return block;
}

}  // namespace

void* ThrowingAllocator::Malloc(std::size_t size) {
    return size == 0 ? nullptr : required(std::malloc(size));
}

void* ThrowingAllocator::Realloc(void* block, std::size_t, std::size_t newSize) {
    if (newSize == 0) {
        std::free(block);
        return nullptr;
    }
    return required(std::realloc(block, newSize));
}

void ThrowingAllocator::Free(void* block) noexcept {
    std::free(block);
}

void* ThrowingAllocator::operator new(std::size_t) noexcept {
    static ThrowingAllocator shared;
    return &shared;
}

}  // namespace nQITRMCWEBSVC100
