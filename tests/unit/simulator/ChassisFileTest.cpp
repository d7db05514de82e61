#include <chrono>
#include <future>
#include <limits>
#include <thread>

#include "ChassisFile.h"
#include "Values.h"

using namespace drivertest;

namespace {

constexpr const char* description = R"({
    "enums": {"Phase": {"Idle": 0, "Busy": 7}},
    "driver_properties": {
        "system": {"Sys.Site": {"type": "StringArray", "value": ["north", "south"]}},
        "session": {"Session.Gain": {"type": "Double", "access": "ReadWrite", "value": 1}},
        "device": {"Dev.Phase": {"type": "Int32", "enum": "Phase", "value": "Idle"}},
        "phys_chan": {"PhysChan.Gain": {"type": "Double", "value": 1}},
        "nvmem_area": {"NVMEMArea.Wear": {"type": "UInt64", "value": 3}}
    },
    "system_values": {"Sys.Simulated": false},
    "session_values": {"Session.Gain": 2.5},
    "devices": [
        {"name": "Größe", "category": 7,
         "values": {"Dev.Phase": 7},
         "channels": {"prefix": "Kanal", "count": 12, "values": {"PhysChan.Gain": 4}},
         "nvmem_areas": [{"name": "cal1", "size": 8}, {"name": "cal2", "size": 8}]},
        {"name": "Slow", "category": 7, "connect_seconds": 0.05},
        {"name": "Glacial", "category": 7, "connect_seconds": 86400},
        {"name": "Dead", "category": 7, "reachable": false},
        {"name": "Lost", "category": 7, "reachable": false, "connect_seconds": 0.01},
        {"name": "Counter", "category": 7,
         "properties": {
             "Count.Signed": {"type": "Int32", "value": 2147483647},
             "Count.Unsigned": {"type": "UInt64", "value": 18446744073709551615},
             "Count.Real": {"type": "Double", "value": 0.25}},
         "commands": {"Count": {"adds": {"Count.Signed": 1, "Count.Unsigned": 2,
                                         "Count.Real": -0.5}}}}
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
    EXPECT_EQ(session.systemList("Sys.Devices"),
              (Names{"Größe", "Slow", "Glacial", "Dead", "Lost", "Counter"}));
    const Names channels = session.deviceList("Größe", "Dev.PhysChans");
    ASSERT_EQ(channels.size(), 12u);
    EXPECT_EQ(channels.back(), "Größe/Kanal11");
}

TEST(ChassisFileTest, LetterCaseIsFoldedByTheRulesOfUnicode) {
    Session session("GRÖSSE");
    EXPECT_EQ(session.list("Session.ReservedDevices"), Names{"Größe"});
}

TEST(ChassisFileTest, RangesMayNameAreasToo) {
    Status status;
    Session session;
    session.close();
    nQITRMCAPI100_initializeSessionWithNvmemAreas(&session.handle, "Größe/cal1:2", 60.0, 3, "", 0.0,
                                                  &status);
    EXPECT_EQ(status.code, 0) << status.text();
    EXPECT_EQ(session.list("Session.DefaultNVMEMAreas"), (Names{"Größe/cal1", "Größe/cal2"}));
}

Outcome connectTo(Handle session, const char* devices, double timeout) {
    Status status;
    nQITRMCAPI100_connectToDevices(session, devices, timeout, &status);
    return {status.code, status.text()};
}

TEST(ChassisFileTest, TheFileAddsPropertiesOfTheDriver) {
    Session session;
    EXPECT_EQ(session.systemList("Sys.Site"), (Names{"north", "south"}));
    EXPECT_EQ(session.systemList("Sys.SystemProperties").back(), "Sys.Site");
    EXPECT_EQ(session.systemList("Sys.DeviceProperties").back(), "Dev.Phase");
    EXPECT_EQ(get(getInt32, session, "Slow", "Dev.Phase"), 0);
    EXPECT_EQ(get(getDouble, session, "Größe/Kanal3", "PhysChan.Gain"), 4.0);
    EXPECT_EQ(get(getUInt64, session, "Größe/cal1", "NVMEMArea.Wear"), std::uint64_t{3});
}

TEST(ChassisFileTest, TheFileSetsValues) {
    Session session;
    Status status;
    std::uint8_t simulated = 1;
    nQITRMCAPI100_getSystemPropertyBool(session, "Sys.Simulated", &simulated, &status);
    EXPECT_EQ(simulated, 0);
    double gain = 0;
    nQITRMCAPI100_getSessionPropertyDouble(session, "Session.Gain", &gain, &status);
    EXPECT_EQ(gain, 2.5);
    EXPECT_EQ(get(getInt32, session, "Größe", "Dev.Phase"), 7);
    EXPECT_EQ(status.code, 0) << status.text();
}

TEST(ChassisFileTest, AddedNumbersWrapAround) {
    Session session("Counter");
    Status status;
    nQITRMCAPI100_executeGenericCommand(session, "Counter", "Count", 1.0, &status);
    EXPECT_EQ(status.code, 0) << status.text();
    EXPECT_EQ(get(getInt32, session, "Counter", "Count.Signed"), -2147483647 - 1);
    EXPECT_EQ(get(getUInt64, session, "Counter", "Count.Unsigned"), std::uint64_t{1});
    EXPECT_EQ(get(getDouble, session, "Counter", "Count.Real"), -0.25);
}

TEST(ChassisFileTest, ConnectingTakesTheDescribedTime) {
    Session session;
    EXPECT_EQ(connectTo(session, "Slow", -1.0).code, 0);
    EXPECT_EQ(session.list("Session.ConnectedDevices"), Names{"Slow"});
    // It is connected already, so no time is needed.
    EXPECT_EQ(connectTo(session, "Slow", 0.0).code, 0);
}

TEST(ChassisFileTest, ConnectingEndsAtItsTimeout) {
    Session session;
    const Outcome outcome = connectTo(session, "Slow", 0.01);
    EXPECT_EQ(outcome.code, -250987);
    EXPECT_EQ(outcome.text, detailsOf("connectTimedOut", usage("Timeout", "\"0.01\"")));
    EXPECT_EQ(session.list("Session.ConnectedDevices"), Names());
    EXPECT_EQ(connectTo(session, "Slow", std::numeric_limits<double>::quiet_NaN()).code, -250962);
}

std::string silence(const std::string& device) {
    return "{\"code\":-250989,\"error_constant\":\"qitrmcsim_noAnswer\",\"component\":"
           "\"qitrmcapi\",\"translator\":\"mxlator_qitrmc\",\"translator_info\":"
           "{\"ordered_data\":[" +
           usage("Device", "\"" + device + "\"") + "]}}";
}

std::string unreachable(const std::string& entries, const std::string& causes) {
    std::string text = detailsOf(
        "deviceUnreachable", "{\"type\":\"header\",\"usage\":\"kAuxTermUnreachableDevices\"}," +
                                 entries + ",{\"type\":\"empty\"}," + usage("Timeout", "\"2\""));
    text.pop_back();
    return text + ",\"nested_error\":" + causes + "}";
}

TEST(ChassisFileTest, AnUnreachableDeviceIsReportedAsTheCause) {
    Session session;
    const Outcome outcome = connectTo(session, "Slow,Dead", 2.0);
    EXPECT_EQ(outcome.code, -250988);
    EXPECT_EQ(outcome.text, unreachable(usage("Device", "\"Dead\""), silence("Dead")));
    EXPECT_EQ(session.list("Session.ConnectedDevices"), Names());
}

TEST(ChassisFileTest, EachUnreachableDeviceIsReportedAsACause) {
    Session session;
    const Outcome outcome = connectTo(session, "Lost,Dead", 2.0);
    EXPECT_EQ(outcome.code, -250988);
    EXPECT_EQ(outcome.text,
              unreachable(usage("Device", "\"Lost\"") + "," + usage("Device", "\"Dead\""),
                          "[" + silence("Lost") + "," + silence("Dead") + "]"));
}

TEST(ChassisFileTest, AbortEndsConnecting) {
    Session session;
    auto result =
        std::async(std::launch::async, [&] { return connectTo(session, "Glacial", 86400.0).code; });
    while (result.wait_for(std::chrono::seconds(0)) != std::future_status::ready) {
        session.abort();
        std::this_thread::yield();
    }
    EXPECT_EQ(result.get(), -250963);
    EXPECT_EQ(session.list("Session.ConnectedDevices"), Names());
}

}  // namespace
