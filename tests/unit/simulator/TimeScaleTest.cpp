#include <chrono>

#include "Values.h"

using namespace drivertest;

namespace {

// The library reads the scale when it is first used.
class UseScale : public testing::Environment {
  public:
    void SetUp() override { setenv("QITRMC_SIM_TIME_SCALE", "1000", 1); }
};

const auto* const environment = testing::AddGlobalTestEnvironment(new UseScale);

using Real = std::chrono::steady_clock;

TEST(TimeScaleTest, ACommandTakesAThousandthOfItsTime) {
    Session session("Mod1");
    Status status;
    const std::uint32_t before = get(getUInt32, session, "Mod1/ch0", "DMM.SampleClock").value;
    const auto start = Real::now();
    nQITRMCAPI100_executeGenericCommand(session, "Mod1", "DMM.Calibrate", 60.0, &status);
    EXPECT_EQ(status.code, 0) << status.text();
    EXPECT_GE(Real::now() - start, std::chrono::milliseconds(30));
    // 50 samples a second, for 30 seconds at least.
    EXPECT_GE(get(getUInt32, session, "Mod1/ch0", "DMM.SampleClock").value - before, 1500u);
}

TEST(TimeScaleTest, ATimeoutComesAfterAThousandthOfItsTime) {
    Session holder("Mod2");
    Session other;
    const auto start = Real::now();
    EXPECT_EQ(other.reserve("Mod2", 3, "", 20.0), -250811);
    EXPECT_GE(Real::now() - start, std::chrono::milliseconds(20));
}

}  // namespace
