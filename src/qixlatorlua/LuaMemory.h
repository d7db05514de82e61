#pragma once

#include <csetjmp>
#include <cstddef>
#include <cstdint>

// Allocators for Lua states. Both functions follow the rules of lua_Alloc; in particular, shrinking
// a block never fails.
namespace qixlatorlua {

// Allocates each block separately, like the interpreter's own allocator. `context` is not used.
void* allocatePlainly(void* context, void* block, std::size_t oldSize, std::size_t newSize);

// The memory of one state, for the length of one translation. Small blocks are cut from large
// chunks; freed blocks are kept in a list for each size; all memory is released with the arena.
// Used by one thread at a time.
//
// A state contains the addresses of its own blocks and nothing else that changes, so a copy of all
// its memory that is written back to the same addresses is the same state again. `keep` makes such
// a copy, and `restore` writes it back.
//
// Blocks that are added after `keep` get memory of their own, so a translation changes few of the
// kept pieces. The large ones that the first complete translation leaves unchanged are not written
// back after further ones, unless those do something that may change any block (see mayChangeAll).
class LuaArena {
  public:
    LuaArena() noexcept = default;
    ~LuaArena();
    LuaArena(const LuaArena&) = delete;
    LuaArena& operator=(const LuaArena&) = delete;

    // A lua_Alloc with the arena as its context.
    static void* allocate(void* arena, void* block, std::size_t oldSize, std::size_t newSize);

    // The bytes that a copy of the blocks needs.
    std::size_t usedSize() const;
    // Copies all blocks as they are now. From then on their memory belongs to the arena until the
    // arena is destroyed, even if they are freed. Returns false if memory runs out. Called at most
    // once.
    bool keep();
    // To be called before anything but a translation by the scripts that are loaded: the kept
    // blocks are then all written back by the next `restore`.
    void mayChangeAll() { isChanged = true; }
    // To be called after all that translations do. What the first one left unchanged is then what
    // none changes; less than that, such as a translator that was never used, does not show it.
    void noteCompleteTranslation() { isComplete = true; }
    // Whether mayChangeAll or the like has happened since `keep` or `restore`.
    bool isAnythingChanged() const { return isChanged; }
    bool isKept() const { return copy != nullptr; }
    // The memory of the kept blocks and of their copy, in bytes.
    std::size_t keptSize() const;
    // Ends a translation: releases the memory that was added since `keep`. The kept blocks are
    // invalid until `restore`.
    void release();
    // Gives the kept blocks the content that they had at `keep`.
    void restore();

    // Where the last finalizer continues while the state is closed; null otherwise. Belongs to
    // closeWithoutFreeing.
    std::jmp_buf* closing = nullptr;

  private:
    // The header of each piece of memory that the arena has allocated.
    struct alignas(8) Piece {
        Piece* next;
        Piece* prev;
        std::size_t size;
        // How many bytes are in the copy; 0 if the piece is not kept.
        std::uint32_t keptSize;
        // Whether no translation changes it.
        bool constant;
    };
    struct FreeBlock {
        FreeBlock* next;
    };
    static constexpr std::size_t grain = 8;
    static constexpr std::size_t largestSmall = 512;
    static constexpr std::size_t chunkSize = 4 * 1024;
    // Smaller pieces are always written back: the stacks and the tables of globals and modules.
    static constexpr std::size_t smallestConstant = 4 * 1024;
    // Where the next small block comes from.
    struct SmallBlocks {
        char* room;
        std::size_t roomSize;
        FreeBlock* freeLists[largestSmall / grain];
    };

    void* get(std::size_t size);
    void* getSmall(std::size_t size);
    void give(void* block, std::size_t size);
    void* resize(void* block, std::size_t oldSize, std::size_t newSize);
    Piece* getPiece(Piece* old, std::size_t size);
    void removePiece(Piece* piece);
    bool addChunk();
    std::size_t usedSize(const Piece* piece) const;
    bool isKept(const void* smallBlock) const;
    void findConstants();
    FreeBlock*& freeBlocks(std::size_t size) { return small.freeLists[(size - 1) / grain]; }

    Piece* pieces = nullptr;
    SmallBlocks small = {};
    // The contents of the kept pieces one after the other, in the order of the list.
    char* copy = nullptr;
    std::size_t copySize = 0;
    SmallBlocks keptSmall = {};
    // Whether any kept block may have changed, not only those that a translation changes.
    bool isChanged = false;
    bool isComplete = false;
    bool hasConstants = false;
};

}  // namespace qixlatorlua
