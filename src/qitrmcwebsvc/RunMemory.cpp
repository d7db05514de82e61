#include "qitrmcwebsvc/RunMemory.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <new>

namespace nQITRMCWEBSVC100 {

RunMemory::RunMemory() noexcept : ring{&ring, &ring} {}

RunMemory::~RunMemory() {
    while (ring.next != &ring) {
        Free(ring.next + 1);
    }
}

void* RunMemory::Malloc(std::size_t size) {
    return Realloc(nullptr, 0, size);
}

void* RunMemory::Realloc(void* block, std::size_t currentSize, std::size_t newSize) {
    if (newSize == 0) {
        Free(block);
        return nullptr;
    }
    if (newSize > static_cast<std::size_t>(-1) - sizeof(Link)) {
        throw std::bad_alloc();
    }
    const bool isInFirst = block && !linkOf(block)->next;
    if (!block || isInFirst) {
        void* const moved = takeFromFirst(newSize);
        void* const fresh = moved ? moved : reallocate(nullptr, newSize);
        if (block) {
            std::memcpy(fresh, block, std::min(currentSize, newSize));
        }
        return fresh;
    }
    return reallocate(linkOf(block), newSize);
}

// Null if there is too little room.
void* RunMemory::takeFromFirst(std::size_t size) noexcept {
    if (size > firstSize) {
        return nullptr;
    }
    const std::size_t needed =
        sizeof(Link) + (size + alignof(Link) - 1) / alignof(Link) * alignof(Link);
    if (needed > firstSize - used) {
        return nullptr;
    }
    Link* const link = new (first + used) Link{nullptr, nullptr};
    used += needed;
    return link + 1;
}

// `old` is null for a new block.
void* RunMemory::reallocate(Link* old, std::size_t size) {
    Link* const link = static_cast<Link*>(std::realloc(old, sizeof(Link) + size));
    if (!link) {
        throw std::bad_alloc();
    }
    if (!old) {
        *link = {ring.previous, &ring};
    }
    link->previous->next = link;
    link->next->previous = link;
    return link + 1;
}

void RunMemory::Free(void* block) noexcept {
    Link* const link = block ? linkOf(block) : nullptr;
    if (!link || !link->next) {
        return;
    }
    link->previous->next = link->next;
    link->next->previous = link->previous;
    std::free(link);
}

}  // namespace nQITRMCWEBSVC100
