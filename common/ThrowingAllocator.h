#pragma once

#include <cstddef>
#include <cstdlib>
#include <new>

// Shared by the plug-in and the simulator.
namespace common {

// The base allocator of JSON types. Implements the JSON library's allocator concept with malloc and
// realloc, but throws std::bad_alloc where those return null.
class ThrowingAllocator {
  public:
    static const bool kNeedFree = true;

    // User-provided so that value-initialisation does not write to the shared instance (see
    // operator new).
    ThrowingAllocator() noexcept {}

    // Null for a size of 0.
    void* Malloc(std::size_t size) { return size == 0 ? nullptr : required(std::malloc(size)); }
    void* Realloc(void* block, std::size_t, std::size_t newSize) {
        if (newSize == 0) {
            std::free(block);
            return nullptr;
        }
        return required(std::realloc(block, newSize));
    }
    static void Free(void* block) noexcept { std::free(block); }

    // The library creates an allocator with new if none is passed, and leaks it if the constructor
    // that does so fails. An allocator has no state, so new always returns the same instance.
    static void* operator new(std::size_t) noexcept {
        static ThrowingAllocator shared;
        return &shared;
    }
    static void operator delete(void*) noexcept {}

  private:
    static void* required(void* block) {
        if (block == nullptr) {
            throw std::bad_alloc();
        }
        return block;
    }
};

}  // namespace common
