#include "support/FaultyAllocator.h"

#include <malloc.h>

#include <atomic>
#include <cstdlib>

#include "qihtl/Allocator.h"

namespace {

std::atomic<std::uint64_t> firstFailure{FaultyAllocator::never};
std::atomic<std::uint64_t> failureCount{0};
std::atomic<std::uint64_t> requestCount{0};
std::atomic<bool> failed{false};
std::atomic<std::int64_t> blocks{0};
std::atomic<std::int64_t> bytes{0};
std::atomic<std::int64_t> peak{0};

void account(std::int64_t difference) {
    const std::int64_t now = bytes += difference;
    if (now > peak) {
        peak = now;
    }
}

}  // namespace

void* qihtl_realloc(void* pointer, std::size_t size) {
    const auto oldSize =
        static_cast<std::int64_t>(pointer == nullptr ? 0 : malloc_usable_size(pointer));
    if (size == 0) {
        blocks -= pointer == nullptr ? 0 : 1;
        account(-oldSize);
        std::free(pointer);
        return nullptr;
    }
    if (static_cast<std::int64_t>(size) > oldSize && FaultyAllocator::nextFails()) {
        return nullptr;
    }
    void* moved = std::realloc(pointer, size);
    if (moved != nullptr) {
        blocks += pointer == nullptr ? 1 : 0;
        account(static_cast<std::int64_t>(malloc_usable_size(moved)) - oldSize);
    }
    return moved;
}

namespace FaultyAllocator {

void failAt(std::uint64_t first, std::uint64_t count) {
    firstFailure = first;
    failureCount = count;
    requestCount = 0;
    failed = false;
    peak = bytes.load();
}

bool nextFails() {
    const std::uint64_t number = requestCount++;
    if (number < firstFailure || number - firstFailure >= failureCount) {
        return false;
    }
    failed = true;
    return true;
}

void succeed() {
    failAt(never, 0);
}

std::uint64_t requests() {
    return requestCount;
}

bool hasFailed() {
    return failed;
}

std::int64_t liveBlocks() {
    return blocks;
}

std::int64_t liveBytes() {
    return bytes;
}

std::int64_t peakBytes() {
    return peak;
}

}  // namespace FaultyAllocator
