#pragma once

#include <cstdint>

// Compiled into a test program, FaultyAllocator.cpp replaces the translators' allocator: it counts
// the live blocks and fails on demand. Further sources make more functions fail in the same count:
//
//   FaultyCalloc.cpp  the buffers of statuses; to be linked with --wrap=calloc
//   FaultyFiles.cpp   the opening of files and directories, which allocates in the C library; to be
//                     linked with --wrap=fopen,--wrap=opendir
//   FaultyNew.cpp     operator new
namespace FaultyAllocator {

constexpr std::uint64_t never = ~std::uint64_t{0};

// Resets the count. Request number `first` (from 0) and the `count` - 1 after it will fail.
// Requests that free or shrink a block are not counted and never fail.
void failAt(std::uint64_t first, std::uint64_t count = 1);
void succeed();

// Counts a request of another allocator. Returns whether it must fail.
bool nextFails();
// Requests since the last call of failAt or succeed.
std::uint64_t requests();
// Whether a request has failed since then.
bool hasFailed();
// Blocks that were handed out and not freed.
std::int64_t liveBlocks();
// The bytes in live blocks, and their maximum since the last failAt or succeed.
std::int64_t liveBytes();
std::int64_t peakBytes();

}  // namespace FaultyAllocator
