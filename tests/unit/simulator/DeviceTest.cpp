#include "Values.h"

using namespace drivertest;

namespace {

Outcome rename(Handle session, const char* device, const char* newName) {
    Status status;
    nQITRMCAPI100_renameDevice(session, device, newName, &status);
    return {status.code, status.text()};
}

Outcome connectTo(Handle session, const char* devices, double timeout = -1.0) {
    Status status;
    nQITRMCAPI100_connectToDevices(session, devices, timeout, &status);
    return {status.code, status.text()};
}

Outcome disconnectFrom(Handle session, const char* devices) {
    Status status;
    nQITRMCAPI100_disconnectFromDevices(session, devices, &status);
    return {status.code, status.text()};
}

using DeviceTest = BenchTest;

TEST_F(DeviceTest, ConnectedDevicesAreListedInOrder) {
    EXPECT_EQ(connectTo(session, "Mod4").code, 0);
    EXPECT_EQ(connectTo(session, "Mod1,mod4").code, 0);
    EXPECT_EQ(session.list("Session.ConnectedDevices"), (Names{"Mod4", "Mod1"}));
    Session other;
    EXPECT_EQ(other.list("Session.ConnectedDevices"), Names());
    EXPECT_EQ(disconnectFrom(session, "Mod4").code, 0);
    EXPECT_EQ(session.list("Session.ConnectedDevices"), Names{"Mod1"});
    EXPECT_EQ(disconnectFrom(session, "$ConnectedDevices").code, 0);
    EXPECT_EQ(session.list("Session.ConnectedDevices"), Names());
}

TEST_F(DeviceTest, DisconnectingWhatIsNotConnectedWarns) {
    connectTo(session, "Mod1");
    const Outcome outcome = disconnectFrom(session, "Mod1,Mod2");
    EXPECT_EQ(outcome.code, 250991);
    EXPECT_EQ(outcome.text, detailsOf("notConnected", usage("Devices", "[\"Mod2\"]")));
    EXPECT_EQ(session.list("Session.ConnectedDevices"), Names());
}

TEST_F(DeviceTest, ConnectionsNeedDevices) {
    Session other;
    EXPECT_EQ(connectTo(other, "$DefaultDevices").code, -250959);
    EXPECT_EQ(connectTo(other, "Mod3").code, -250956);
    EXPECT_EQ(disconnectFrom(other, "Mod1/ch0").code, -250956);
}

TEST_F(DeviceTest, AResetRestoresThePropertiesOfAllParts) {
    EXPECT_EQ(set(setDouble, session, "Mod2/ch0", "PSU.Voltage", 5.0).code, 0);
    EXPECT_EQ(set(setDouble, session, "Mod2/ch0", "PSU.CurrentLimit", 1.0).code, 0);
    EXPECT_EQ(set(setDouble, session, "Mod1", "DMM.Range", 1.0).code, 0);
    EXPECT_EQ(resetDevices(session, "Mod1,Mod2"), 0);
    EXPECT_EQ(get(getDouble, session, "Mod1", "DMM.Range"), 10.0);
    EXPECT_EQ(get(getDouble, session, "Mod2/ch0", "PSU.Voltage"), 0.0);
    Status status;
    nQITRMCAPI100_commitPropertiesGeneric(session, "Mod2", &status);
    EXPECT_EQ(get(getDouble, session, "Mod2/ch0", "PSU.CurrentLimit"), 0.1);
}

TEST_F(DeviceTest, AResetKeepsTheTextsOfTheUser) {
    EXPECT_EQ(set(setText, session, "Mod2", "Dev.Comment", "lent").code, 0);
    EXPECT_EQ(set(setText, session, "Mod2/ch0", "PhysChan.Comment", "worn").code, 0);
    EXPECT_EQ(resetDevices(session, "Mod2"), 0);
    EXPECT_EQ(getText(session, "Mod2", "Dev.Comment"), std::string("lent"));
    EXPECT_EQ(getText(session, "Mod2/ch0", "PhysChan.Comment"), std::string("worn"));
    EXPECT_EQ(set(setText, session, "Mod2/ch0", "PhysChan.Comment", "").code, 0);
}

TEST_F(DeviceTest, AResetNeedsWriteAccessToTheDevices) {
    EXPECT_EQ(set(setText, session, "Mod1", "Dev.Comment", "kept").code, 0);
    session.unreserve("Mod1");
    Session other;
    EXPECT_EQ(resetDevices(other, "Mod1,Mod2"), -250811);
    EXPECT_EQ(getText(session, "Mod1", "Dev.Comment"), std::string("kept"));
    EXPECT_EQ(resetDevices(other, "Mod1"), 0);
}

TEST_F(DeviceTest, ANewNameIsUsedEverywhere) {
    Status status;
    Session onChannel;
    onChannel.close();
    session.unreserve("Mod1");
    nQITRMCAPI100_initializeSessionWithPhysChans(&onChannel.handle, "Mod1/ch0", 60.0, 3, "", 0.0,
                                                 &status);
    EXPECT_EQ(rename(onChannel, "mod1", "Meter").code, 0);
    EXPECT_EQ(session.systemList("Sys.Devices"), (Names{"Bench", "Meter", "Mod2", "Mod4", "Mod5"}));
    EXPECT_EQ(session.deviceList("Bench", "Dev.Modules"), (Names{"Meter", "Mod2", "Mod4", "Mod5"}));
    EXPECT_EQ(session.deviceList("Meter", "Dev.NVMEM.Areas"),
              (Names{"Meter/user", "Meter/calibration"}));
    EXPECT_EQ(onChannel.list("Session.DefaultPhysChans"), Names{"Meter/ch0"});
    EXPECT_EQ(onChannel.list("Session.ReservedDevices"), Names{"Meter"});
    EXPECT_EQ(getText(onChannel, "$DefaultDevices", "Dev.Name"), std::string("Meter"));
    EXPECT_EQ(get(getDouble, onChannel, "Mod1", "DMM.Range").code, -250956);
    EXPECT_EQ(get(getDouble, onChannel, "meter", "DMM.Range"), 10.0);
    EXPECT_EQ(rename(onChannel, "Meter", "Mod1").code, 0);
}

TEST_F(DeviceTest, ANameMayChangeInLetterCaseAlone) {
    EXPECT_EQ(rename(session, "Mod1", "MOD1").code, 0);
    EXPECT_EQ(session.systemList("Sys.Devices")[1], "MOD1");
    EXPECT_EQ(rename(session, "MOD1", "Mod1").code, 0);
}

TEST_F(DeviceTest, TwoDevicesCanSwapTheirNames) {
    EXPECT_EQ(rename(session, "Mod1", "x").code, 0);
    EXPECT_EQ(rename(session, "Mod2", "Mod1").code, 0);
    EXPECT_EQ(rename(session, "x", "Mod2").code, 0);
    EXPECT_EQ(get(getUInt32, session, "Mod1", "Dev.SlotNum"), 2u);
    EXPECT_EQ(rename(session, "Mod1", "x").code, 0);
    EXPECT_EQ(rename(session, "Mod2", "Mod1").code, 0);
    EXPECT_EQ(rename(session, "x", "Mod2").code, 0);
    EXPECT_EQ(get(getUInt32, session, "Mod1", "Dev.SlotNum"), 1u);
}

TEST_F(DeviceTest, RenamesAreCounted) {
    const auto changes = [&] {
        Status status;
        std::uint64_t count = 0;
        nQITRMCAPI100_getSystemPropertyUInt64(session, "Sys.ConfigChangeCount", &count, &status);
        EXPECT_EQ(status.code, 0) << status.text();
        return count;
    };
    const std::uint64_t before = changes();
    EXPECT_EQ(rename(session, "Bench", "Rack").code, 0);
    EXPECT_EQ(rename(session, "Rack", "Bench").code, 0);
    EXPECT_EQ(rename(session, "Bench", "Mod1").code, -250986);
    EXPECT_EQ(changes(), before + 2);
}

TEST_F(DeviceTest, ANameThatIsTakenIsRefused) {
    const Outcome outcome = rename(session, "Mod1", "mod2");
    EXPECT_EQ(outcome.code, -250986);
    EXPECT_EQ(outcome.text, detailsOf("nameInUse", usage("Device", "\"Mod2\"")));
}

TEST_F(DeviceTest, ANameThatCannotBeWrittenIsRefused) {
    const Outcome outcome = rename(session, "Mod1", "A/B");
    EXPECT_EQ(outcome.code, -250985);
    EXPECT_EQ(
        outcome.text,
        detailsOf("invalidName",
                  usage("RequestedValue", "\"A/B\"") + "," +
                      usage("Details", "\"a name must not hold a comma, a slash or a colon\"")));
    for (const char* name : {"", "A,B", "A:B", "$A", " A", "A ", "A\n", "\xFF"}) {
        EXPECT_EQ(rename(session, "Mod1", name).code, -250985) << name;
    }
    EXPECT_EQ(rename(session, "Mod1", std::string(65, 'x').c_str()).code, -250985);
}

TEST_F(DeviceTest, ExactlyOneKnownDeviceCanBeRenamed) {
    EXPECT_EQ(rename(session, "Mod3", "A").code, -250956);
    EXPECT_EQ(rename(session, "Mod1,Mod2", "A").code, -250966);
    EXPECT_EQ(rename(session, "Mod1/ch0", "A").code, -250956);
    EXPECT_EQ(rename(session, "Mod1", nullptr).code, -250954);
}

TEST_F(DeviceTest, AnotherSessionsDeviceIsNotRenamed) {
    Session other;
    EXPECT_EQ(rename(other, "Mod1", "A").code, -250811);
    EXPECT_EQ(rename(other, "Bench", "Rack").code, 0);
    EXPECT_EQ(rename(other, "Rack", "Bench").code, 0);
}

}  // namespace
