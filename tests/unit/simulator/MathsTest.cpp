#include "live/Maths.h"

#include <gtest/gtest.h>

#include <limits>

namespace {

using Limits = std::numeric_limits<double>;

TEST(MathsTest, NanBecomesZero) {
    EXPECT_EQ(simulator::finite(Limits::quiet_NaN()), 0.0);
    EXPECT_EQ(simulator::finite(-Limits::quiet_NaN()), 0.0);
}

TEST(MathsTest, HugeNumbersAreLimitedAndOthersUnchanged) {
    EXPECT_EQ(simulator::finite(Limits::infinity()), 1e300);
    EXPECT_EQ(simulator::finite(-Limits::infinity()), -1e300);
    EXPECT_EQ(simulator::finite(Limits::max()), 1e300);
    EXPECT_EQ(simulator::finite(-1e300), -1e300);
    EXPECT_EQ(simulator::finite(0.1), 0.1);
}

}  // namespace
