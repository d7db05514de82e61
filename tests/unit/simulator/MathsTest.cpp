#include "live/Maths.h"

#include <gtest/gtest.h>

#include <limits>

namespace {

using Limits = std::numeric_limits<double>;

TEST(MathsTest, NanBecomesZero) {
    EXPECT_EQ(simulator::tame(Limits::quiet_NaN()), 0.0);
    EXPECT_EQ(simulator::tame(-Limits::quiet_NaN()), 0.0);
}

TEST(MathsTest, HugeNumbersAreLimitedAndOthersUnchanged) {
    EXPECT_EQ(simulator::tame(Limits::infinity()), 1e300);
    EXPECT_EQ(simulator::tame(-Limits::infinity()), -1e300);
    EXPECT_EQ(simulator::tame(Limits::max()), 1e300);
    EXPECT_EQ(simulator::tame(-1e300), -1e300);
    EXPECT_EQ(simulator::tame(0.1), 0.1);
}

}  // namespace
