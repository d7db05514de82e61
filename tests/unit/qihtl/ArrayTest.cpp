#include "qihtl/Array.h"

#include <gtest/gtest.h>

#include <utility>

#include "qihtl/String.h"
#include "support/FaultyAllocator.h"

namespace {

class ArrayTest : public testing::Test {
  protected:
    void SetUp() override { FaultyAllocator::succeed(); }
    void TearDown() override { FaultyAllocator::succeed(); }

    qierr::Status status;
};

TEST_F(ArrayTest, GrowsFromNothingToEight) {
    qihtl::Array<int> array;
    array.append(7, &status);
    EXPECT_EQ(array.length(), 1u);
    EXPECT_EQ(array.capacity(), 8u);
    EXPECT_EQ(array[0], 7);
}

TEST_F(ArrayTest, ReservesExactlyTheRequestedSize) {
    qihtl::Array<int> array;
    array.reserve(4, &status);
    EXPECT_EQ(array.capacity(), 4u);
    array.reserve(2, &status);
    EXPECT_EQ(array.capacity(), 4u);
}

TEST_F(ArrayTest, GrowsFromFourToEightAndThenByHalf) {
    qihtl::Array<int> array;
    array.reserve(4, &status);
    for (int value = 0; value < 5; ++value) {
        array.append(value, &status);
    }
    EXPECT_EQ(array.capacity(), 8u);
    for (int value = 5; value < 9; ++value) {
        array.append(value, &status);
    }
    EXPECT_EQ(array.capacity(), 12u);
    for (std::uint32_t index = 0; index < array.length(); ++index) {
        EXPECT_EQ(array[index], static_cast<int>(index));
    }
}

TEST_F(ArrayTest, ElementsThatOwnMemoryMoveAndAreFreed) {
    const std::int64_t before = FaultyAllocator::liveBlocks();
    {
        qihtl::Array<qihtl::String> array;
        for (int count = 0; count < 20; ++count) {
            qihtl::String text;
            text.assign("element", &status);
            array.append(std::move(text), &status);
        }
        for (const qihtl::String& text : array) {
            EXPECT_STREQ(text.c_str(), "element");
        }
    }
    EXPECT_EQ(FaultyAllocator::liveBlocks(), before);
}

TEST_F(ArrayTest, AFailedAllocationSetsMemoryFullAndKeepsTheElements) {
    qihtl::Array<int> array;
    for (int value = 0; value < 8; ++value) {
        array.append(value, &status);
    }
    FaultyAllocator::failAt(0);
    array.append(8, &status);
    EXPECT_EQ(status.code, -52000);
    EXPECT_EQ(array.length(), 8u);
    EXPECT_EQ(array[7], 7);
}

TEST_F(ArrayTest, ASizeThatOverflowsIsMemoryFull) {
    qihtl::Array<double> array;
    array.reserve(0x20000000, &status);
    EXPECT_EQ(status.code, -52000);
    EXPECT_EQ(qihtl_grownCapacity(0x0FFFFFFF, 0x10000000, sizeof(double)), 0u);
    EXPECT_EQ(qihtl_grownCapacity(0x0FFFFFFE, 0x0FFFFFFF, sizeof(double)), 0x0FFFFFFFu);
}

TEST_F(ArrayTest, NothingIsDoneWhenTheStatusIsNegative) {
    qihtl::Array<int> array;
    status.code = -1;
    array.reserve(4, &status);
    array.append(1, &status);
    EXPECT_EQ(array.capacity(), 0u);
    EXPECT_EQ(array.length(), 0u);
    EXPECT_EQ(status.code, -1);
}

}  // namespace
