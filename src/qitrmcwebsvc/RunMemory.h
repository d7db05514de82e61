#pragma once

#include <cstddef>

namespace nQITRMCWEBSVC100 {

// The memory of one run of a schema validator. Implements the JSON library's allocator concept.
//
// A validator that is interrupted by an allocation failure contains uninitialised pointers, so its
// destructor must not run. Therefore no validator is destroyed: all objects of a run, including the
// validator, are allocated here. The first blocks lie in the object itself and are freed with it,
// which spares most requests any other allocation. The others are linked so that they can be freed
// together, and those that the library frees during the run are freed immediately.
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
    // The header of each block. The headers of blocks outside of `first` form a circular list that
    // begins at `ring`; the others contain nulls.
    struct alignas(std::max_align_t) Link {
        Link* previous;
        Link* next;
    };

    void* takeFromFirst(std::size_t size) noexcept;
    void* reallocate(Link* old, std::size_t size);
    static Link* linkOf(void* block) noexcept { return static_cast<Link*>(block) - 1; }

    static constexpr std::size_t firstSize = 16384;

    Link ring;
    std::size_t used = 0;  // bytes of `first`, with the headers
    alignas(std::max_align_t) char first[firstSize];
};

}  // namespace nQITRMCWEBSVC100
