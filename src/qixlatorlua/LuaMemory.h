#pragma once

#include <cstddef>

// Where the memory of Lua states comes from. Both functions have the meaning of lua_Alloc and never
// fail to shrink a block, on which the interpreter relies.
namespace qixlatorlua {

// Every block by itself, as the interpreter's own allocator does it. `context` is not used.
void* allocatePlainly(void* context, void* block, std::size_t oldSize, std::size_t newSize);

// The memory of one state, which lives for one translation: small blocks are cut from large chunks,
// sorted by size when they are given back, and freed with the arena. Used by one thread.
class LuaArena {
  public:
    LuaArena() noexcept = default;
    ~LuaArena();
    LuaArena(const LuaArena&) = delete;
    LuaArena& operator=(const LuaArena&) = delete;

    // A lua_Alloc, with the arena for its context. All blocks end with the arena.
    static void* allocate(void* arena, void* block, std::size_t oldSize, std::size_t newSize);

  private:
    // What stands before each piece of memory that the arena got for itself.
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
