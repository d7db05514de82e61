#include "qixlatorlua/LuaMemory.h"

#include <cassert>
#include <cstring>

#include "qihtl/Allocator.h"

namespace qixlatorlua {

namespace {

// Builds with assertions check after each translation what those without rely on.
#ifdef NDEBUG
constexpr bool checksConstants = false;
#else
constexpr bool checksConstants = true;
#endif

}  // namespace

void* allocatePlainly(void*, void* block, std::size_t oldSize, std::size_t newSize) {
    void* moved = qihtl_realloc(block, newSize);
    return moved == nullptr && newSize != 0 && newSize <= oldSize ? block : moved;
}

LuaArena::~LuaArena() {
    while (pieces != nullptr) {
        removePiece(pieces);
    }
    qihtl_realloc(copy, 0);
}

void* LuaArena::allocate(void* arena, void* block, std::size_t oldSize, std::size_t newSize) {
    auto* self = static_cast<LuaArena*>(arena);
    if (newSize == 0) {
        self->give(block, oldSize);
        return nullptr;
    }
    void* const result =
        block == nullptr ? self->get(newSize) : self->resize(block, oldSize, newSize);
    // A script may handle the failure and go on in another way than usual.
    self->isChanged = self->isChanged || result == nullptr;
    return result;
}

// Allocates a piece and adds it to the list, or resizes `old`, which may move.
LuaArena::Piece* LuaArena::getPiece(Piece* old, std::size_t size) {
    auto* piece = static_cast<Piece*>(qihtl_realloc(old, sizeof(Piece) + size));
    if (piece == nullptr) {
        return nullptr;
    }
    if (old == nullptr) {
        piece->next = pieces;
        piece->prev = nullptr;
        piece->keptSize = 0;
        piece->constant = false;
    }
    piece->size = size;
    (piece->prev == nullptr ? pieces : piece->prev->next) = piece;
    if (piece->next != nullptr) {
        piece->next->prev = piece;
    }
    return piece;
}

void LuaArena::removePiece(Piece* piece) {
    (piece->prev == nullptr ? pieces : piece->prev->next) = piece->next;
    if (piece->next != nullptr) {
        piece->next->prev = piece->prev;
    }
    qihtl_realloc(piece, 0);
}

bool LuaArena::addChunk() {
    Piece* piece = getPiece(nullptr, chunkSize);
    if (piece == nullptr) {
        return false;
    }
    small.room = reinterpret_cast<char*>(piece + 1);
    small.roomSize = chunkSize;
    return true;
}

void* LuaArena::getSmall(std::size_t size) {
    FreeBlock*& list = freeBlocks(size);
    if (list != nullptr) {
        FreeBlock* block = list;
        list = block->next;
        return block;
    }
    const std::size_t rounded = (size + grain - 1) / grain * grain;
    if (rounded > small.roomSize && !addChunk()) {
        return nullptr;
    }
    void* block = small.room;
    small.room += rounded;
    small.roomSize -= rounded;
    return block;
}

void* LuaArena::get(std::size_t size) {
    if (size <= largestSmall) {
        return getSmall(size);
    }
    Piece* piece = getPiece(nullptr, size);
    return piece == nullptr ? nullptr : piece + 1;
}

void LuaArena::give(void* block, std::size_t size) {
    if (block == nullptr) {
        return;
    }
    if (size <= largestSmall) {
        isChanged = isChanged || isKept(block);
        auto* freed = static_cast<FreeBlock*>(block);
        freed->next = freeBlocks(size);
        freeBlocks(size) = freed;
        return;
    }
    Piece* piece = static_cast<Piece*>(block) - 1;
    if (piece->keptSize != 0) {
        // It may be the interpreter's table of strings. When that grows, each string, in whatever
        // piece it lies, gets another link to the next one.
        isChanged = true;
    } else {
        removePiece(piece);
    }
}

void* LuaArena::resize(void* block, std::size_t oldSize, std::size_t newSize) {
    if (oldSize > largestSmall && newSize > largestSmall) {
        Piece* old = static_cast<Piece*>(block) - 1;
        if (old->keptSize == 0) {
            Piece* piece = getPiece(old, newSize);
            return piece != nullptr ? piece + 1 : newSize <= oldSize ? block : nullptr;
        }
    }
    void* moved = get(newSize);
    if (moved == nullptr) {
        // Shrinking must not fail, so the block stays where it is.
        return newSize <= oldSize ? block : nullptr;
    }
    std::memcpy(moved, block, oldSize < newSize ? oldSize : newSize);
    give(block, oldSize);
    return moved;
}

// The room at the end of the current chunk contains no blocks.
std::size_t LuaArena::usedSize(const Piece* piece) const {
    const auto* content = reinterpret_cast<const char*>(piece + 1);
    const bool isCurrentChunk = small.room + small.roomSize == content + piece->size;
    return isCurrentChunk ? piece->size - small.roomSize : piece->size;
}

std::size_t LuaArena::usedSize() const {
    std::size_t size = 0;
    for (const Piece* piece = pieces; piece != nullptr; piece = piece->next) {
        size += usedSize(piece);
    }
    return size;
}

bool LuaArena::isKept(const void* smallBlock) const {
    const auto address = reinterpret_cast<std::uintptr_t>(smallBlock);
    for (const Piece* piece = isKept() ? pieces : nullptr; piece != nullptr; piece = piece->next) {
        if (address - reinterpret_cast<std::uintptr_t>(piece + 1) < piece->keptSize) {
            return true;
        }
    }
    return false;
}

bool LuaArena::keep() {
    copySize = usedSize();
    copy = static_cast<char*>(qihtl_realloc(nullptr, copySize));
    if (copy == nullptr) {
        return false;
    }
    char* to = copy;
    for (Piece* piece = pieces; piece != nullptr; piece = piece->next) {
        piece->keptSize = static_cast<std::uint32_t>(usedSize(piece));
        std::memcpy(to, piece + 1, piece->keptSize);
        to += piece->keptSize;
    }
    keptSmall = {small.room, small.roomSize, {}};
    small = keptSmall;
    isChanged = false;
    return true;
}

std::size_t LuaArena::keptSize() const {
    std::size_t size = copySize;
    for (const Piece* piece = pieces; piece != nullptr; piece = piece->next) {
        size += piece->keptSize == 0 ? 0 : sizeof(Piece) + piece->size;
    }
    return size;
}

void LuaArena::findConstants() {
    const char* content = copy;
    for (Piece* piece = pieces; piece != nullptr; piece = piece->next) {
        const bool isUnchanged = std::memcmp(piece + 1, content, piece->keptSize) == 0;
        assert(isUnchanged || !piece->constant);
        if (!hasConstants) {
            piece->constant = isUnchanged && piece->keptSize >= smallestConstant;
        }
        content += piece->keptSize;
    }
    hasConstants = true;
}

void LuaArena::release() {
    // New pieces are added at the front, so all of them are before the kept ones.
    while (pieces != nullptr && pieces->keptSize == 0) {
        removePiece(pieces);
    }
    if (!isChanged && (hasConstants ? checksConstants : isComplete)) {
        findConstants();
    }
}

void LuaArena::restore() {
    small = keptSmall;
    const char* from = copy;
    for (Piece* piece = pieces; piece != nullptr; piece = piece->next) {
        if (isChanged || !piece->constant) {
            std::memcpy(piece + 1, from, piece->keptSize);
        }
        from += piece->keptSize;
    }
    isChanged = false;
    isComplete = false;
}

}  // namespace qixlatorlua
