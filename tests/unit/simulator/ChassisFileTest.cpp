#include "ChassisFile.h"
#include "Driver.h"

using namespace drivertest;

namespace {

constexpr const char* description = R"({
    "devices": [
        {"name": "Größe", "category": 7,
         "channels": {"prefix": "Kanal", "count": 12},
         "nvmem_areas": [{"name": "cal1", "size": 8}, {"name": "cal2", "size": 8}]}
    ]
})";

// The library reads the description when it is first used.
class UseDescription : public testing::Environment {
  public:
    void SetUp() override { setenv("QITRMC_SIM_CHASSIS", file.path.c_str(), 1); }

  private:
    ChassisFile file{description};
};

const auto* const environment = testing::AddGlobalTestEnvironment(new UseDescription);

TEST(ChassisFileTest, TheDevicesAreThoseOfTheFile) {
    Session session;
    EXPECT_EQ(session.systemList("Sys.Devices"), Names{"Größe"});
    const Names channels = session.deviceList("Größe", "Dev.PhysChans");
    ASSERT_EQ(channels.size(), 12u);
    EXPECT_EQ(channels.back(), "Größe/Kanal11");
}

TEST(ChassisFileTest, LetterCaseIsFoldedAsUnicodeSays) {
    Session session("GRÖSSE");
    EXPECT_EQ(session.list("Session.ReservedDevices"), Names{"Größe"});
}

TEST(ChassisFileTest, RangesNameAreasToo) {
    Status status;
    Session session;
    session.close();
    nQITRMCAPI100_initializeSessionWithNvmemAreas(&session.handle, "Größe/cal1:2", 60.0, 3, "", 0.0,
                                                  &status);
    EXPECT_EQ(status.code, 0) << status.text();
    EXPECT_EQ(session.list("Session.DefaultNVMEMAreas"), (Names{"Größe/cal1", "Größe/cal2"}));
}

}  // namespace
