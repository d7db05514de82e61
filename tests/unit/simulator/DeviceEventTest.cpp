// Devices that are removed from their slots or lose their connection.

#include <functional>

#include "FaultsInForce.h"
#include "Values.h"

using namespace drivertest;

namespace {

constexpr std::int32_t deviceRemoved = -250940;
constexpr std::int32_t connectionLost = -250941;
constexpr std::int32_t deviceUnreachable = -250988;

const std::string pulled = "{\"events\":[{\"device\":\"Mod2\",\"event\":\"pulled\"}]}";
const std::string lost = "{\"events\":[{\"device\":\"Mod2\",\"event\":\"connection_lost\"}]}";

class DeviceEventTest : public BenchTest {
  protected:
    std::int32_t readTemperature(const char* device) {
        return get(getDouble, session, device, "Dev.Temperature").code;
    }
    std::int32_t connect(const char* devices) {
        Status status;
        nQITRMCAPI100_connectToDevices(session, devices, 0.0, &status);
        return status.code;
    }
    std::int32_t codeOf(void (*function)(Handle, const char*, qierr_Status*), const char* names) {
        Status status;
        function(session, names, &status);
        return status.code;
    }
    std::uint64_t changeCount() {
        Status status;
        std::uint64_t count = 0;
        nQITRMCAPI100_getSystemPropertyUInt64(session, "Sys.ConfigChangeCount", &count, &status);
        return count;
    }
    // Every kind of operation on Mod2 and its parts.
    std::vector<std::int32_t> codesOfOperations() {
        Status writing;
        nQITRMCAPI100_writeRegisterUInt8(session, "Mod2", 256, 1, &writing);
        Status executing;
        nQITRMCAPI100_executeGenericCommand(session, "Mod2/ch0", "PSU.On", 1.0, &executing);
        Status opening;
        nQITRMCAPI100_Property property = 0;
        nQITRMCAPI100_openGenericProperty(session, "Mod2/ch0", "PSU.Voltage", &property, &opening);
        Status renaming;
        nQITRMCAPI100_renameDevice(session, "Mod2", "Other", &renaming);
        Handle handle = 0;
        Status starting;
        nQITRMCAPI100_initializeSessionWithPhysChans(&handle, "Mod2/ch0", 60.0, 1, "", 0.0,
                                                     &starting);
        return {readTemperature("Mod2"),
                readTemperature("Mod1,Mod2"),
                get(getDouble, session, "Mod2/ch0", "PSU.Voltage").code,
                get(getUInt32, session, "mod2/user", "NVMEMArea.Size").code,
                set(setDouble, session, "Mod2/ch1", "PSU.Voltage", 1.0).code,
                writing.code,
                executing.code,
                opening.code,
                renaming.code,
                starting.code,
                session.reserve("Mod2"),
                session.unreserve("Mod2"),
                codeOf(nQITRMCAPI100_resetDevices, "Mod2"),
                codeOf(nQITRMCAPI100_commitPropertiesGeneric, "Mod2"),
                codeOf(nQITRMCAPI100_commitNvmemGeneric, "Mod2/user"),
                codeOf(nQITRMCAPI100_disconnectFromDevices, "Mod2")};
    }
};

TEST_F(DeviceEventTest, OperationsOnARemovedModuleFail) {
    const FaultsInForce faults(pulled);
    EXPECT_EQ(codesOfOperations(), std::vector<std::int32_t>(16, deviceRemoved));
    EXPECT_EQ(connect("Mod2"), deviceRemoved);
    EXPECT_EQ(get(getDouble, session, "Mod2", "Dev.Temperature").text,
              detailsOf("deviceRemoved", usage("Device", "\"Mod2\"")));
    EXPECT_EQ(readTemperature("Mod1"), 0);
}

TEST_F(DeviceEventTest, OperationsOnALostDeviceFail) {
    const FaultsInForce faults(lost);
    EXPECT_EQ(codesOfOperations(), std::vector<std::int32_t>(16, connectionLost));
    EXPECT_EQ(get(getDouble, session, "Mod2/ch1", "PSU.Voltage").text,
              detailsOf("connectionLost", usage("Device", "\"Mod2\"")));
    EXPECT_EQ(readTemperature("Mod1"), 0);
}

TEST_F(DeviceEventTest, APropertyThatFollowsARemovedModuleIsZero) {
    EXPECT_EQ(set(setDouble, session, "Mod2/ch0", "PSU.Voltage", 20.0).code, 0);
    EXPECT_EQ(execute(session, "Mod2/ch0", "PSU.On", 1.0).code, 0);
    const auto measured = [&] { return get(getDouble, session, "Mod1/ch0", "DMM.Voltage").value; };
    while (measured() < 19.0) {
    }
    const FaultsInForce faults(pulled);
    // Except for the noise of the multimeter, at most six standard deviations.
    EXPECT_NEAR(measured(), 0.0, 6 * 0.00005);
}

TEST_F(DeviceEventTest, ARemovedModuleIsInNoListOfTheSystem) {
    const FaultsInForce faults(pulled);
    EXPECT_EQ(session.systemList("Sys.Devices"), (Names{"Bench", "Mod1", "Mod4", "Mod5"}));
    EXPECT_EQ(session.deviceList("Bench", "Dev.Modules"), (Names{"Mod1", "Mod4", "Mod5"}));
}

TEST_F(DeviceEventTest, ALostDeviceStaysInTheListsOfTheSystem) {
    const FaultsInForce faults(lost);
    EXPECT_EQ(session.systemList("Sys.Devices"), (Names{"Bench", "Mod1", "Mod2", "Mod4", "Mod5"}));
    EXPECT_EQ(session.deviceList("Bench", "Dev.Modules"), (Names{"Mod1", "Mod2", "Mod4", "Mod5"}));
}

TEST_F(DeviceEventTest, DefaultAndReservedTokensStillNameAMissingDevice) {
    ASSERT_EQ(connect("Mod1,Mod2"), 0);
    for (const auto& [plan, code] : {std::pair(pulled, deviceRemoved), {lost, connectionLost}}) {
        const FaultsInForce faults(plan);
        EXPECT_EQ(readTemperature("$DefaultDevices"), code);
        EXPECT_EQ(readTemperature("$ReservedDevices"), code);
        EXPECT_EQ(readTemperature("$ConnectedDevices"), 0);
    }
}

TEST_F(DeviceEventTest, ReservationsAreKept) {
    {
        const FaultsInForce faults(pulled);
        EXPECT_EQ(session.list("Session.ReservedDevices"), (Names{"Mod1", "Mod2", "Mod4", "Mod5"}));
        EXPECT_EQ(session.list("Session.DefaultDevices"), (Names{"Mod1", "Mod2", "Mod4", "Mod5"}));
    }
    Session other;
    EXPECT_EQ(other.reserve("Mod2"), -250811);
}

TEST_F(DeviceEventTest, AllSessionsLoseTheConnection) {
    Session other;
    Status connecting;
    nQITRMCAPI100_connectToDevices(other, "Mod2,Mod4", 0.0, &connecting);
    ASSERT_EQ(connecting.code, 0);
    for (const std::string& plan : {lost, pulled}) {
        ASSERT_EQ(connect("Mod1,Mod2"), 0);
        {
            const FaultsInForce faults(plan);
            EXPECT_EQ(session.list("Session.ConnectedDevices"), Names{"Mod1"});
            EXPECT_EQ(other.list("Session.ConnectedDevices"), Names{"Mod4"});
        }
        EXPECT_EQ(session.list("Session.ConnectedDevices"), Names{"Mod1"});
    }
}

TEST_F(DeviceEventTest, ALostDeviceCannotBeConnected) {
    {
        const FaultsInForce faults(lost);
        Status status;
        nQITRMCAPI100_connectToDevices(session, "Mod1,Mod2", 0.0, &status);
        EXPECT_EQ(status.code, deviceUnreachable);
        EXPECT_NE(status.text().find(usage("Device", "\"Mod2\"")), std::string::npos);
        EXPECT_EQ(status.text().find("Mod1"), std::string::npos);
    }
    EXPECT_EQ(connect("Mod2"), 0);
}

TEST_F(DeviceEventTest, ALostDeviceKeepsItsStateAndAnswersAfterwards) {
    ASSERT_EQ(set(setDouble, session, "Mod2/ch0", "PSU.Voltage", 5.0).code, 0);
    ASSERT_EQ(set(setDouble, session, "Mod2/ch0", "PSU.CurrentLimit", 2.0).code, 0);
    FaultsInForce(lost).replace("{}");
    EXPECT_EQ(get(getDouble, session, "Mod2/ch0", "PSU.Voltage"), 5.0);
    EXPECT_EQ(codeOf(nQITRMCAPI100_commitPropertiesGeneric, "Mod2"), 0);
    EXPECT_EQ(get(getDouble, session, "Mod2/ch0", "PSU.CurrentLimit"), 2.0);
}

TEST_F(DeviceEventTest, AnInsertedModuleIsInItsStateAfterPowerOn) {
    ASSERT_EQ(set(setDouble, session, "Mod2/ch0", "PSU.Voltage", 5.0).code, 0);
    ASSERT_EQ(set(setDouble, session, "Mod2/ch0", "PSU.CurrentLimit", 2.0).code, 0);
    Status writing;
    nQITRMCAPI100_writeRegisterUInt8(session, "Mod2", 256, 7, &writing);
    const std::uint8_t bytes[] = {1, 2};
    nQITRMCAPI100_setNvmemBytes(session, "Mod2/user", 0, bytes, 1, "", "", &writing);
    nQITRMCAPI100_commitNvmemGeneric(session, "Mod2/user", &writing);
    nQITRMCAPI100_setNvmemBytes(session, "Mod2/user", 1, bytes + 1, 1, "", "", &writing);
    nQITRMCAPI100_renameDevice(session, "Mod2", "Supply", &writing);
    ASSERT_EQ(writing.code, 0) << writing.text();
    FaultsInForce("{\"events\":[{\"device\":\"Supply\",\"event\":\"pulled\"}]}").replace("{}");
    EXPECT_EQ(get(getDouble, session, "Supply/ch0", "PSU.Voltage"), 0.0);
    EXPECT_EQ(codeOf(nQITRMCAPI100_commitPropertiesGeneric, "Supply"), 0);
    EXPECT_EQ(get(getDouble, session, "Supply/ch0", "PSU.CurrentLimit"), 0.1);
    Status reading;
    std::uint8_t value = 9;
    nQITRMCAPI100_readRegisterUInt8(session, "Supply", 256, &value, &reading);
    EXPECT_EQ(value, 0);
    std::uint8_t content[] = {9, 9};
    nQITRMCAPI100_getNvmemBytes(session, "Supply/user", 0, content, 2, &reading);
    EXPECT_EQ(reading.code, 0) << reading.text();
    EXPECT_EQ(std::vector<int>(content, content + 2), (std::vector<int>{1, 0}));
    const std::uint8_t nothing = 0;
    nQITRMCAPI100_setNvmemBytes(session, "Supply/user", 0, &nothing, 1, "", "", &reading);
    nQITRMCAPI100_commitNvmemGeneric(session, "Supply/user", &reading);
    nQITRMCAPI100_renameDevice(session, "Supply", "Mod2", &reading);
    EXPECT_EQ(reading.code, 0) << reading.text();
}

TEST_F(DeviceEventTest, TheNameOfARemovedModuleStaysReserved) {
    const FaultsInForce faults(pulled);
    Status status;
    nQITRMCAPI100_renameDevice(session, "Mod1", "MOD2", &status);
    EXPECT_EQ(status.code, -250986);
}

TEST_F(DeviceEventTest, RemovingAndInsertingChangeTheConfiguration) {
    const std::uint64_t before = changeCount();
    {
        const FaultsInForce faults(pulled);
        EXPECT_EQ(changeCount(), before + 1);
    }
    EXPECT_EQ(changeCount(), before + 2);
    FaultsInForce(lost).replace("{}");
    EXPECT_EQ(changeCount(), before + 2);
}

TEST_F(DeviceEventTest, AnEventInTheOldAndTheNewPlanContinues) {
    FaultsInForce faults(pulled);
    const std::uint64_t before = changeCount();
    faults.replace(pulled);
    EXPECT_EQ(changeCount(), before);
    EXPECT_EQ(readTemperature("Mod2"), deviceRemoved);
    faults.replace(lost);
    EXPECT_EQ(readTemperature("Mod2"), connectionLost);
}

TEST_F(DeviceEventTest, ARemovedModuleIsReportedAsRemovedAndNotAsLost) {
    const FaultsInForce faults(
        "{\"events\":[{\"device\":\"Mod2\",\"event\":\"pulled\"},"
        "{\"device\":\"Mod2\",\"event\":\"connection_lost\"}]}");
    EXPECT_EQ(readTemperature("Mod2"), deviceRemoved);
}

TEST_F(DeviceEventTest, ALostChassisKeepsItsModules) {
    const FaultsInForce faults(
        "{\"events\":[{\"device\":\"Bench\",\"event\":\"connection_lost\"}]}");
    EXPECT_EQ(readTemperature("Mod2"), 0);
    EXPECT_EQ(getText(session, "Bench", "Dev.ProductName").code, connectionLost);
}

TEST_F(DeviceEventTest, AnEventMayHaveNoDuration) {
    const FaultsInForce faults(
        "{\"events\":[{\"device\":\"Mod2\",\"event\":\"pulled\",\"lasts\":0}]}");
    EXPECT_EQ(readTemperature("Mod2"), 0);
}

TEST_F(DeviceEventTest, FaultsAndEventsCanBeCombined) {
    const FaultsInForce faults(
        "{\"faults\":[{\"resource\":\"Mod2\",\"calls\":{\"count\":1},\"status\":{\"code\":-77}}],"
        "\"events\":[{\"device\":\"Mod2\",\"event\":\"pulled\"}]}");
    EXPECT_EQ(readTemperature("Mod2"), -77);
    EXPECT_EQ(readTemperature("Mod2"), deviceRemoved);
}

}  // namespace
