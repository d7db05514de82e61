// Replaces the operator new of the whole process, so that each allocation can be made to fail in
// turn. To be included by one file of a program.

#pragma once

#include <algorithm>
#include <atomic>
#include <functional>
#include <new>

#include "Values.h"

namespace drivertest {

namespace {

// How many allocations with new still succeed; all do when it is negative.
std::atomic<long> allowed{-1};
// Whether an allocation has failed.
std::atomic<bool> denied{false};
// The number of live allocations, and the maximum since this was last set.
std::atomic<long> liveAllocations{0};
std::atomic<long> mostAllocations{0};

void* allocate(std::size_t size) {
    if (allowed.load() == 0) {
        denied = true;
        return nullptr;
    }
    if (allowed.load() > 0) {
        --allowed;
    }
    ++liveAllocations;
    mostAllocations = std::max(mostAllocations.load(), liveAllocations.load());
    return std::malloc(size != 0 ? size : 1);
}

void release(void* memory) {
    liveAllocations -= memory != nullptr ? 1 : 0;
    std::free(memory);
}

}  // namespace

}  // namespace drivertest

void* operator new(std::size_t size) {
    void* memory = drivertest::allocate(size);
    if (memory == nullptr) {
        throw std::bad_alloc();
    }
    return memory;
}
void* operator new[](std::size_t size) {
    return operator new(size);
}
void operator delete(void* memory) noexcept {
    drivertest::release(memory);
}
void operator delete[](void* memory) noexcept {
    drivertest::release(memory);
}
void operator delete(void* memory, std::size_t) noexcept {
    drivertest::release(memory);
}
void operator delete[](void* memory, std::size_t) noexcept {
    drivertest::release(memory);
}

namespace drivertest {

namespace {

constexpr std::int32_t outOfMemory = -250950;

// Makes each allocation of a call fail in turn. Every attempt must end in outOfMemory, or in the
// code that the call has when memory suffices. Returns how many allocations the call makes.
long starve(std::int32_t usual, const std::function<void(qierr_Status*)>& call) {
    for (long count = 0;; ++count) {
        Status status;
        allowed = count;
        denied = false;
        call(&status);
        allowed = -1;
        if (!denied) {
            EXPECT_EQ(status.code, usual) << status.text();
            return count;
        }
        if (status.code != outOfMemory && status.code != usual) {
            ADD_FAILURE() << "code " << status.code << " with " << count << " allocations";
            return count;
        }
        EXPECT_EQ(status.text(), "{}") << "with " << count << " allocations";
    }
}

}  // namespace

}  // namespace drivertest
