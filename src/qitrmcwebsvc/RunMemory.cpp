#include "qitrmcwebsvc/RunMemory.h"

#include <cstdlib>
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

void* RunMemory::Realloc(void* block, std::size_t, std::size_t newSize) {
    if (newSize == 0) {
        Free(block);
        return nullptr;
    }
    if (newSize > static_cast<std::size_t>(-1) - sizeof(Link)) {
        throw std::bad_alloc();
    }
    Link* const old = block ? linkOf(block) : nullptr;
    Link* const link = static_cast<Link*>(std::realloc(old, sizeof(Link) + newSize));
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
    if (!block) {
        return;
    }
    Link* const link = linkOf(block);
    link->previous->next = link->next;
    link->next->previous = link->previous;
    std::free(link);
}

}  // namespace nQITRMCWEBSVC100
