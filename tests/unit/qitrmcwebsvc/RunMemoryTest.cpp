#include "qitrmcwebsvc/RunMemory.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <cstring>
#include <limits>
#include <new>

namespace nQITRMCWEBSVC100 {
namespace {

// The leak checker verifies that the remaining blocks are freed.

TEST(RunMemory, FreesRemainingAndReturnedBlocks) {
    RunMemory memory;
    void* const first = memory.Malloc(10);
    void* const second = memory.Malloc(20);
    void* const third = memory.Malloc(30);
    std::memset(first, 1, 10);
    std::memset(third, 3, 30);
    RunMemory::Free(second);
    RunMemory::Free(nullptr);
    EXPECT_EQ(static_cast<char*>(third)[29], 3);
}

TEST(RunMemory, KeepsTheContentOfABlockThatGrows) {
    RunMemory memory;
    memory.Malloc(8);
    void* block = memory.Malloc(8);
    std::memcpy(block, "12345678", 8);
    memory.Malloc(8);
    block = memory.Realloc(block, 8, 100000);
    EXPECT_EQ(std::memcmp(block, "12345678", 8), 0);
    block = memory.Realloc(block, 100000, 4);
    EXPECT_EQ(std::memcmp(block, "1234", 4), 0);
}

TEST(RunMemory, KeepsTheContentOfEachOfManyGrowingBlocks) {
    constexpr std::size_t count = 50;
    RunMemory memory;
    unsigned char* blocks[count] = {};
    for (std::size_t size = 1; size < 1000; size *= 3) {
        for (std::size_t i = 0; i < count; ++i) {
            blocks[i] = static_cast<unsigned char*>(memory.Realloc(blocks[i], size / 3, size));
            std::memset(blocks[i] + size / 3, static_cast<int>(i), size - size / 3);
        }
    }
    for (std::size_t i = 0; i < count; ++i) {
        EXPECT_TRUE(std::all_of(blocks[i], blocks[i] + 729, [i](int byte) {
            return byte == static_cast<int>(i);
        })) << i;
    }
}

TEST(RunMemory, ReturnsNullForNoBytes) {
    RunMemory memory;
    EXPECT_EQ(memory.Malloc(0), nullptr);
    EXPECT_EQ(memory.Realloc(memory.Malloc(5), 5, 0), nullptr);
}

TEST(RunMemory, AlignsBlocksForAnyType) {
    RunMemory memory;
    for (std::size_t size : {1, 3, 17}) {
        EXPECT_EQ(reinterpret_cast<std::uintptr_t>(memory.Malloc(size)) % alignof(std::max_align_t),
                  0u);
    }
}

TEST(RunMemory, RefusesASizeBeyondTheAddressSpace) {
    RunMemory memory;
    EXPECT_THROW(memory.Malloc(std::numeric_limits<std::size_t>::max()), std::bad_alloc);
}

}  // namespace
}  // namespace nQITRMCWEBSVC100
