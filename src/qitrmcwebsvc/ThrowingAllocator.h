#pragma once

#include <cstddef>

namespace nQITRMCWEBSVC100 {

// The base allocator of every JSON type, after the JSON library's concept of an allocator: the C
// library's memory, with std::bad_alloc in place of null.
class ThrowingAllocator {
  public:
    static const bool kNeedFree = true;

    // Written out so that making one does not write to it: all of them share one instance.
    ThrowingAllocator() noexcept {}

    // Null for a size of 0.
    void* Malloc(std::size_t size);
    void* Realloc(void* block, std::size_t currentSize, std::size_t newSize);
    static void Free(void* block) noexcept;

    // The library allocates an allocator for itself where it is given none, and loses it when the
    // constructor that did so fails. There is nothing in one, so all are the same one.
    static void* operator new(std::size_t) noexcept;
    static void operator delete(void*) noexcept {}
};

}  // namespace nQITRMCWEBSVC100
