#pragma once

#include <cstddef>

namespace nQITRMCWEBSVC100 {

// The base allocator of every JSON type. Implements the JSON library's allocator concept with
// malloc and realloc, but throws std::bad_alloc where those return null.
class ThrowingAllocator {
  public:
    static const bool kNeedFree = true;

    // User-provided so that value-initialisation does not write to the shared instance (see
    // operator new).
    ThrowingAllocator() noexcept {}

    // Null for a size of 0.
    void* Malloc(std::size_t size);
    void* Realloc(void* block, std::size_t currentSize, std::size_t newSize);
    static void Free(void* block) noexcept;

    // The library creates an allocator with new if none is passed, and leaks it if the constructor
    // that does so fails. An allocator has no state, so new always returns the same instance.
    static void* operator new(std::size_t) noexcept;
    static void operator delete(void*) noexcept {}
};

}  // namespace nQITRMCWEBSVC100
