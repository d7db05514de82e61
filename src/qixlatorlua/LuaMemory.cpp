#include "qixlatorlua/LuaMemory.h"

#include <cstring>

#include "qihtl/Allocator.h"

namespace qixlatorlua {

void* allocatePlainly(void*, void* block, std::size_t oldSize, std::size_t newSize) {
    void* moved = qihtl_realloc(block, newSize);
    return moved == nullptr && newSize != 0 && newSize <= oldSize ? block : moved;
}

LuaArena::~LuaArena() {
    while (pieces != nullptr) {
        Piece* next = pieces->next;
        qihtl_realloc(pieces, 0);
        pieces = next;
    }
}

void* LuaArena::allocate(void* arena, void* block, std::size_t oldSize, std::size_t newSize) {
    auto* self = static_cast<LuaArena*>(arena);
    if (newSize == 0) {
        self->give(block, oldSize);
        return nullptr;
    }
    return block == nullptr ? self->get(newSize) : self->resize(block, oldSize, newSize);
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
    }
    (piece->prev == nullptr ? pieces : piece->prev->next) = piece;
    if (piece->next != nullptr) {
        piece->next->prev = piece;
    }
    return piece;
}

bool LuaArena::addChunk() {
    Piece* piece = getPiece(nullptr, chunkSize);
    if (piece == nullptr) {
        return false;
    }
    room = reinterpret_cast<char*>(piece + 1);
    roomSize = chunkSize;
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
    if (rounded > roomSize && !addChunk()) {
        return nullptr;
    }
    void* block = room;
    room += rounded;
    roomSize -= rounded;
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
        auto* freed = static_cast<FreeBlock*>(block);
        freed->next = freeBlocks(size);
        freeBlocks(size) = freed;
        return;
    }
    Piece* piece = static_cast<Piece*>(block) - 1;
    (piece->prev == nullptr ? pieces : piece->prev->next) = piece->next;
    if (piece->next != nullptr) {
        piece->next->prev = piece->prev;
    }
    qihtl_realloc(piece, 0);
}

void* LuaArena::resize(void* block, std::size_t oldSize, std::size_t newSize) {
    if (oldSize > largestSmall && newSize > largestSmall) {
        Piece* piece = getPiece(static_cast<Piece*>(block) - 1, newSize);
        return piece != nullptr ? piece + 1 : newSize <= oldSize ? block : nullptr;
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

}  // namespace qixlatorlua
