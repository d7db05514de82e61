#include "common/ThreadShares.h"

#include <gtest/gtest.h>

#include <atomic>
#include <cstdint>
#include <future>
#include <set>
#include <vector>

using common::ThreadShares;

namespace {

using Counts = ThreadShares<std::atomic<int>>;

std::vector<int> valuesOf(const Counts& counts) {
    std::vector<int> values;
    counts.forEach([&](const std::atomic<int>& count) { values.push_back(count); });
    return values;
}

int sumOf(const Counts& counts) {
    int sum = 0;
    counts.forEach([&](const std::atomic<int>& count) { sum += count; });
    return sum;
}

// The item of a new thread.
std::atomic<int>* itemOfNewThread(Counts& counts) {
    return std::async(std::launch::async, [&] { return &counts.own(); }).get();
}

TEST(ThreadShares, BeginWithValuesOfNought) {
    const Counts counts;
    for (const int value : valuesOf(counts)) {
        EXPECT_EQ(value, 0);
    }
}

TEST(ThreadShares, GiveAThreadAlwaysTheSameItem) {
    Counts counts;
    std::atomic<int>* const first = &counts.own();
    itemOfNewThread(counts);
    EXPECT_EQ(&counts.own(), first);
    EXPECT_EQ(&static_cast<const Counts&>(counts).own(), first);
}

TEST(ThreadShares, GiveSeveralThreadsSeveralItemsInCacheLinesOfTheirOwn) {
    Counts counts;
    std::set<std::uintptr_t> lines;
    const std::size_t number = valuesOf(counts).size();
    for (std::size_t i = 0; i < number; ++i) {
        lines.insert(reinterpret_cast<std::uintptr_t>(itemOfNewThread(counts)) / 64);
    }
    EXPECT_GT(number, 1u);
    EXPECT_EQ(lines.size(), number);
}

TEST(ThreadShares, HoldWhatMoreThreadsThanItemsHaveAdded) {
    Counts counts;
    std::vector<std::future<void>> threads;
    for (int i = 0; i < 40; ++i) {
        threads.push_back(std::async(std::launch::async, [&] {
            for (int repeat = 0; repeat < 1000; ++repeat) {
                ++counts.own();
            }
        }));
    }
    for (std::future<void>& thread : threads) {
        thread.get();
    }
    EXPECT_EQ(sumOf(counts), 40000);
}

}  // namespace
