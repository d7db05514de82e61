#pragma once

#include <cstddef>

namespace nQITRMCWEBSVC100 {

// The memory of one run of a schema validator. Implements the JSON library's allocator concept.
//
// A validator that is interrupted by an allocation failure contains uninitialised pointers, so its
// destructor must not run. Therefore no validator is destroyed: all objects of a run, including the
// validator, are allocated here, and the blocks are linked so that they can be freed together.
// Blocks that the library frees during the run are freed immediately.
class RunMemory {
  public:
    static const bool kNeedFree = true;

    RunMemory() noexcept;
    // Frees the blocks without calling destructors of the objects in them.
    ~RunMemory();
    RunMemory(const RunMemory&) = delete;
    RunMemory& operator=(const RunMemory&) = delete;

    // Null for a size of 0. Throws std::bad_alloc; all blocks are then unchanged.
    void* Malloc(std::size_t size);
    void* Realloc(void* block, std::size_t currentSize, std::size_t newSize);
    // Null is ignored.
    static void Free(void* block) noexcept;

  private:
    // The header of each block. The headers form a circular list that begins at `ring`.
    struct alignas(std::max_align_t) Link {
        Link* previous;
        Link* next;
    };

    static Link* linkOf(void* block) noexcept { return static_cast<Link*>(block) - 1; }

    Link ring;
};

}  // namespace nQITRMCWEBSVC100
