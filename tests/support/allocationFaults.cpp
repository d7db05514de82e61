#include "support/allocationFaults.h"

#include <cstdlib>
#include <new>

#include "support/FaultFree.h"

extern "C" {
void* __real_malloc(std::size_t size);
void* __real_calloc(std::size_t count, std::size_t size);
void* __real_realloc(void* block, std::size_t size);
}

namespace {

struct Fault {
    bool armed = false;
    AllocationFault::Extent extent = AllocationFault::Extent::One;
    int successesLeft = 0;
    bool struck = false;
};

thread_local Fault fault;

bool strikes() {
    if (!fault.armed || FaultFree::isActive()) {
        return false;
    }
    if (fault.struck) {
        return fault.extent == AllocationFault::Extent::AllFromThere;
    }
    fault.struck = fault.successesLeft-- == 0;
    return fault.struck;
}

}  // namespace

AllocationFault::AllocationFault(int successes, Extent extent) {
    fault = {true, extent, successes, false};
}

AllocationFault::~AllocationFault() {
    fault.armed = false;
}

bool AllocationFault::hasStruck() const {
    return fault.struck;
}

extern "C" {

void* __wrap_malloc(std::size_t size) {
    return strikes() ? nullptr : __real_malloc(size);
}

void* __wrap_calloc(std::size_t count, std::size_t size) {
    return strikes() ? nullptr : __real_calloc(count, size);
}

void* __wrap_realloc(void* block, std::size_t size) {
    return strikes() ? nullptr : __real_realloc(block, size);
}
}

void* operator new(std::size_t size) {
    if (void* const block = std::malloc(size == 0 ? 1 : size)) {
        return block;
    }
    throw std::bad_alloc();
}

void* operator new(std::size_t size, const std::nothrow_t&) noexcept {
    return std::malloc(size == 0 ? 1 : size);
}

void operator delete(void* block) noexcept {
    std::free(block);
}

void operator delete(void* block, std::size_t) noexcept {
    std::free(block);
}
