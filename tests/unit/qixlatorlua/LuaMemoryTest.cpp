#include "qixlatorlua/LuaMemory.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <cstring>
#include <memory>
#include <random>
#include <string>
#include <vector>

#include "support/FaultyAllocator.h"

namespace {

using qixlatorlua::allocatePlainly;
using qixlatorlua::LuaArena;

class LuaMemoryTest : public testing::Test {
  protected:
    void SetUp() override { FaultyAllocator::succeed(); }
    void TearDown() override { FaultyAllocator::succeed(); }
};

struct Block {
    unsigned char* bytes;
    std::size_t size;
    unsigned char filling;
};

bool isIntact(const Block& block, std::size_t size) {
    for (std::size_t index = 0; index < size; ++index) {
        if (block.bytes[index] != block.filling) {
            return false;
        }
    }
    return true;
}

TEST_F(LuaMemoryTest, BlocksKeepTheirContentThroughAnySequenceOfRequests) {
    const std::int64_t before = FaultyAllocator::liveBlocks();
    {
        LuaArena arena;
        std::mt19937 random(1);
        std::vector<Block> blocks;
        for (int step = 0; step < 20000; ++step) {
            const std::size_t size = 1 + random() % (random() % 4 == 0 ? 3000 : 200);
            const auto filling = static_cast<unsigned char>(step);
            const std::size_t kind = random() % 3;
            if (kind == 0 || blocks.empty()) {
                auto* bytes =
                    static_cast<unsigned char*>(LuaArena::allocate(&arena, nullptr, 0, size));
                ASSERT_EQ(reinterpret_cast<std::uintptr_t>(bytes) % 8, 0u);
                std::memset(bytes, filling, size);
                blocks.push_back({bytes, size, filling});
                continue;
            }
            Block& block = blocks[random() % blocks.size()];
            ASSERT_TRUE(isIntact(block, block.size));
            if (kind == 1) {
                auto* bytes = static_cast<unsigned char*>(
                    LuaArena::allocate(&arena, block.bytes, block.size, size));
                block.bytes = bytes;
                ASSERT_TRUE(isIntact(block, std::min(block.size, size)));
                std::memset(bytes, filling, size);
                block = {bytes, size, filling};
            } else {
                LuaArena::allocate(&arena, block.bytes, block.size, 0);
                block = blocks.back();
                blocks.pop_back();
            }
        }
        for (const Block& block : blocks) {
            EXPECT_TRUE(isIntact(block, block.size));
        }
    }
    EXPECT_EQ(FaultyAllocator::liveBlocks(), before);
}

TEST_F(LuaMemoryTest, FreedBlocksAreReused) {
    LuaArena arena;
    for (int count = 0; count < 100000; ++count) {
        void* small = LuaArena::allocate(&arena, nullptr, 0, 100);
        void* large = LuaArena::allocate(&arena, nullptr, 0, 1000);
        LuaArena::allocate(&arena, small, 100, 0);
        LuaArena::allocate(&arena, large, 1000, 0);
    }
    EXPECT_GT(100000, FaultyAllocator::peakBytes() - FaultyAllocator::liveBytes());
}

TEST_F(LuaMemoryTest, LackOfMemoryReturnsNullAndKeepsTheOldBlock) {
    LuaArena arena;
    FaultyAllocator::failAt(0, FaultyAllocator::never);
    EXPECT_EQ(LuaArena::allocate(&arena, nullptr, 0, 100), nullptr);
    EXPECT_EQ(LuaArena::allocate(&arena, nullptr, 0, 1000), nullptr);
    FaultyAllocator::succeed();
    auto* block = static_cast<char*>(LuaArena::allocate(&arena, nullptr, 0, 1000));
    std::memset(block, 'x', 1000);
    FaultyAllocator::failAt(0, FaultyAllocator::never);
    EXPECT_EQ(LuaArena::allocate(&arena, block, 1000, 100000), nullptr);
    EXPECT_EQ(block[999], 'x');
}

TEST_F(LuaMemoryTest, ShrinkingNeverFails) {
    const std::int64_t before = FaultyAllocator::liveBlocks();
    {
        LuaArena arena;
        void* block = LuaArena::allocate(&arena, nullptr, 0, 2000);
        FaultyAllocator::failAt(0, FaultyAllocator::never);
        block = LuaArena::allocate(&arena, block, 2000, 1000);
        ASSERT_NE(block, nullptr);
        block = LuaArena::allocate(&arena, block, 1000, 100);
        ASSERT_NE(block, nullptr);
        LuaArena::allocate(&arena, block, 100, 0);
    }
    FaultyAllocator::succeed();
    EXPECT_EQ(FaultyAllocator::liveBlocks(), before);
}

// Blocks in an arena that keeps them: a small one, and three so large that they are not written
// back after translations that leave them unchanged.
class KeptBlocks {
  public:
    KeptBlocks() {
        for (std::size_t index = 0; index < count; ++index) {
            blocks[index] =
                static_cast<char*>(LuaArena::allocate(&arena, nullptr, 0, sizes[index]));
            std::memset(blocks[index], 'k', sizes[index]);
        }
        EXPECT_TRUE(arena.keep());
    }

    // The first complete translation changes the last large block.
    void translateFirst() {
        translate([this] {
            std::memset(blocks[3], 'x', sizes[3]);
            arena.noteCompleteTranslation();
        });
    }

    // Expects that the blocks are as they were after a translation that does this.
    template <typename Action>
    void translate(Action action) {
        action();
        arena.release();
        arena.restore();
        for (std::size_t index = 0; index < count; ++index) {
            EXPECT_TRUE(std::string(blocks[index], sizes[index]) == std::string(sizes[index], 'k'))
                << "block " << index;
        }
    }

    void changeAll() {
        for (std::size_t index = 0; index < count; ++index) {
            std::memset(blocks[index], 'x', sizes[index]);
        }
    }

    static constexpr std::size_t count = 4;
    static constexpr std::size_t sizes[count] = {100, 10000, 10000, 10000};
    LuaArena arena;
    char* blocks[count];
};

TEST_F(LuaMemoryTest, WhatATranslationChangesIsWrittenBack) {
    KeptBlocks kept;
    kept.translateFirst();
    for (int round = 0; round < 3; ++round) {
        kept.translate([&] {
            std::memset(kept.blocks[0], 'x', KeptBlocks::sizes[0]);
            std::memset(kept.blocks[3], 'x', KeptBlocks::sizes[3]);
        });
    }
}

TEST_F(LuaMemoryTest, EverythingIsWrittenBackUntilATranslationWasComplete) {
    KeptBlocks kept;
    kept.translate([] {});
    kept.translate([&] { kept.changeAll(); });
    kept.translateFirst();
}

TEST_F(LuaMemoryTest, EverythingIsWrittenBackAfterWhatMayChangeAll) {
    KeptBlocks kept;
    kept.translateFirst();
    kept.translate([&] {
        kept.arena.mayChangeAll();
        kept.changeAll();
    });
}

TEST_F(LuaMemoryTest, EverythingIsWrittenBackAfterAKeptBlockWasFreed) {
    for (std::size_t index = 0; index < KeptBlocks::count; ++index) {
        KeptBlocks kept;
        kept.translateFirst();
        kept.translate([&] {
            kept.changeAll();
            LuaArena::allocate(&kept.arena, kept.blocks[index], KeptBlocks::sizes[index], 0);
        });
        kept.translate([&] {
            kept.changeAll();
            LuaArena::allocate(&kept.arena, kept.blocks[index], KeptBlocks::sizes[index],
                               KeptBlocks::sizes[index] + 2000);
        });
    }
}

TEST_F(LuaMemoryTest, ABlockOfATranslationIsReusedWithinIt) {
    KeptBlocks kept;
    void* block = LuaArena::allocate(&kept.arena, nullptr, 0, 100);
    LuaArena::allocate(&kept.arena, block, 100, 0);
    EXPECT_EQ(LuaArena::allocate(&kept.arena, nullptr, 0, 100), block);
}

TEST_F(LuaMemoryTest, ThePlainRuntimeAllocatesEachBlockByItself) {
    const std::int64_t before = FaultyAllocator::liveBlocks();
    void* first = allocatePlainly(nullptr, nullptr, 0, 10);
    void* second = allocatePlainly(nullptr, nullptr, 0, 10);
    EXPECT_EQ(FaultyAllocator::liveBlocks(), before + 2);
    first = allocatePlainly(nullptr, first, 10, 1000);
    EXPECT_EQ(FaultyAllocator::liveBlocks(), before + 2);
    EXPECT_EQ(allocatePlainly(nullptr, first, 1000, 0), nullptr);
    EXPECT_EQ(allocatePlainly(nullptr, second, 10, 0), nullptr);
    EXPECT_EQ(allocatePlainly(nullptr, nullptr, 0, 0), nullptr);
    EXPECT_EQ(FaultyAllocator::liveBlocks(), before);
}

}  // namespace
