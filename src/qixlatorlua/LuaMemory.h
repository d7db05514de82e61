#pragma once

#include <cstddef>

// Allocators for Lua states. Both functions follow the rules of lua_Alloc; in particular, shrinking
// a block never fails.
namespace qixlatorlua {

// Allocates each block separately, like the interpreter's own allocator. `context` is not used.
void* allocatePlainly(void* context, void* block, std::size_t oldSize, std::size_t newSize);

// The memory of one state, for the length of one translation. Small blocks are cut from large
// chunks; freed blocks are kept in a list for each size; all memory is released with the arena.
// Used by one thread.
class LuaArena {
  public:
    LuaArena() noexcept = default;
    ~LuaArena();
    LuaArena(const LuaArena&) = delete;
    LuaArena& operator=(const LuaArena&) = delete;

    // A lua_Alloc with the arena as its context.
    static void* allocate(void* arena, void* block, std::size_t oldSize, std::size_t newSize);

  private:
    // The header of each piece of memory that the arena has allocated.
    struct alignas(8) Piece {
        Piece* next;
        Piece* prev;
    };
    struct FreeBlock {
        FreeBlock* next;
    };
    static constexpr std::size_t grain = 8;
    static constexpr std::size_t largestSmall = 512;
    static constexpr std::size_t chunkSize = 32 * 1024;

    void* get(std::size_t size);
    void* getSmall(std::size_t size);
    void give(void* block, std::size_t size);
    void* resize(void* block, std::size_t oldSize, std::size_t newSize);
    Piece* getPiece(Piece* old, std::size_t size);
    bool addChunk();
    FreeBlock*& freeBlocks(std::size_t size) { return freeLists[(size - 1) / grain]; }

    Piece* pieces = nullptr;
    char* room = nullptr;
    std::size_t roomSize = 0;
    FreeBlock* freeLists[largestSmall / grain] = {};
};

}  // namespace qixlatorlua
