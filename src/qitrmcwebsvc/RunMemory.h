#pragma once

#include <cstddef>

namespace nQITRMCWEBSVC100 {

// The memory of one run of a schema validator, after the JSON library's concept of an allocator.
//
// A validator that an allocation failure interrupts holds pointers that were never set, so it must
// not be destroyed. Therefore none is: all that belongs to a run, the validator included, lies in
// blocks of this memory, which know of each other and go when the memory goes. Blocks that are
// given back during the run are freed at once.
class RunMemory {
  public:
    static const bool kNeedFree = true;

    RunMemory() noexcept;
    // Frees the blocks without destroying what is in them.
    ~RunMemory();
    RunMemory(const RunMemory&) = delete;
    RunMemory& operator=(const RunMemory&) = delete;

    // Null for a size of 0. Throws std::bad_alloc, which leaves all blocks as they were.
    void* Malloc(std::size_t size);
    void* Realloc(void* block, std::size_t currentSize, std::size_t newSize);
    // Null is ignored.
    static void Free(void* block) noexcept;

  private:
    // Stands in front of each block; together they are a ring, with `ring` as its first link.
    struct alignas(std::max_align_t) Link {
        Link* previous;
        Link* next;
    };

    static Link* linkOf(void* block) noexcept { return static_cast<Link*>(block) - 1; }

    Link ring;
};

}  // namespace nQITRMCWEBSVC100
