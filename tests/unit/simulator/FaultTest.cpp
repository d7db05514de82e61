// Which calls a fault applies to, and how they end.

#include "FaultsInForce.h"
#include "Values.h"

using namespace drivertest;

namespace {

constexpr std::int32_t failure = -77;
const std::string failing = "\"status\":{\"code\":-77}";

class FaultTest : public BenchTest {
  protected:
    std::int32_t readTemperature(const char* device = "Mod1") {
        return get(getDouble, session, device, "Dev.Temperature").code;
    }
    std::vector<std::int32_t> codesOfReads(int count) {
        std::vector<std::int32_t> codes;
        for (int i = 0; i < count; ++i) {
            codes.push_back(readTemperature());
        }
        return codes;
    }
};

using Codes = std::vector<std::int32_t>;

TEST_F(FaultTest, WithoutFaultsEverythingWorks) {
    const FaultsInForce none("{}");
    EXPECT_EQ(readTemperature(), 0);
}

TEST_F(FaultTest, AFaultOfAFunctionAppliesToThatFunctionOnly) {
    const FaultsInForce faults(oneFault("\"function\":\"getGenericPropertyDouble\"," + failing));
    EXPECT_EQ(readTemperature(), failure);
    EXPECT_EQ(getText(session, "Mod1", "Dev.ProductName").code, 0);
    EXPECT_EQ(getArray(getDoubles, session, "Mod1", "DMM.Readings").code, 0);
}

TEST_F(FaultTest, ARenamedDeviceIsFoundByItsDescribedNameToo) {
    Status status;
    nQITRMCAPI100_renameDevice(session, "Mod1", "Meter", &status);
    EXPECT_EQ(status.code, 0);
    {
        const FaultsInForce faults(oneFault("\"resource\":\"Mod1\"," + failing));
        EXPECT_EQ(readTemperature("Meter"), failure);
        EXPECT_EQ(readTemperature("Mod2"), 0);
    }
    {
        const FaultsInForce faults(
            "{\"events\":[{\"device\":\"mod1\",\"event\":\"connection_lost\"}]}");
        EXPECT_EQ(readTemperature("Meter"), -250941);
    }
    nQITRMCAPI100_renameDevice(session, "Meter", "Mod1", &status);
    EXPECT_EQ(status.code, 0);
}

TEST_F(FaultTest, AStarStandsForAnyEnding) {
    const FaultsInForce faults(oneFault("\"function\":\"getGenericPropertyDouble*\"," + failing));
    EXPECT_EQ(readTemperature(), failure);
    EXPECT_EQ(getArray(getDoubles, session, "Mod1", "DMM.Readings").code, failure);
    EXPECT_EQ(getText(session, "Mod1", "Dev.ProductName").code, 0);
}

TEST_F(FaultTest, AFaultWithoutAFunctionAppliesToEveryCall) {
    const FaultsInForce faults(oneFault(failing));
    EXPECT_EQ(readTemperature(), failure);
    EXPECT_EQ(session.abort(), failure);
    Handle handle = 7;
    Status status;
    nQITRMCAPI100_initializeSessionWithoutResources(&handle, &status);
    EXPECT_EQ(status.code, failure);
    EXPECT_EQ(handle, 0u);
}

TEST_F(FaultTest, TheFirstMatchingFaultApplies) {
    const FaultsInForce faults(
        "{\"faults\":[{\"status\":{\"code\":-1},\"calls\":{\"count\":1}},{\"status\":{\"code\":-2}}"
        "]"
        "}");
    EXPECT_EQ(codesOfReads(3), (Codes{-1, -2, -2}));
}

TEST_F(FaultTest, EveryFaultCountsItsMatchingCalls) {
    const FaultsInForce faults(
        "{\"faults\":[{\"status\":{\"code\":-1},\"calls\":{\"count\":2}},"
        "{\"status\":{\"code\":-2},\"calls\":{\"first\":2,\"count\":2}}]}");
    EXPECT_EQ(codesOfReads(4), (Codes{-1, -1, -2, 0}));
}

TEST_F(FaultTest, CallsAreChosenByTheirNumber) {
    FaultsInForce faults(oneFault("\"calls\":{\"first\":3}," + failing));
    EXPECT_EQ(codesOfReads(4), (Codes{0, 0, -77, -77}));
    faults.replace(oneFault("\"calls\":{\"first\":2,\"count\":2}," + failing));
    EXPECT_EQ(codesOfReads(4), (Codes{0, -77, -77, 0}));
    faults.replace(oneFault("\"calls\":{\"first\":2,\"every\":2}," + failing));
    EXPECT_EQ(codesOfReads(5), (Codes{0, -77, 0, -77, 0}));
    faults.replace(oneFault("\"calls\":{\"every\":3,\"count\":2}," + failing));
    EXPECT_EQ(codesOfReads(8), (Codes{-77, 0, 0, -77, 0, 0, 0, 0}));
}

TEST_F(FaultTest, OnlyCallsThatMatchAreCounted) {
    const FaultsInForce faults(
        oneFault("\"function\":\"getGenericPropertyDouble\",\"resource\":\"Mod1\","
                 "\"calls\":{\"first\":2},\"status\":{\"code\":-77}"));
    EXPECT_EQ(readTemperature("Mod2"), 0);
    EXPECT_EQ(getText(session, "Mod1", "Dev.ProductName").code, 0);
    EXPECT_EQ(readTemperature("Mod1"), 0);
    EXPECT_EQ(readTemperature("Mod2"), 0);
    EXPECT_EQ(readTemperature("Mod1"), failure);
}

TEST_F(FaultTest, ADeviceCoversItsChannelsAndAreas) {
    const FaultsInForce faults(oneFault("\"resource\":\"mod2\"," + failing));
    EXPECT_EQ(get(getDouble, session, "Mod2/ch1", "PSU.Voltage").code, failure);
    EXPECT_EQ(get(getUInt32, session, "Mod2/user", "NVMEMArea.Size").code, failure);
    EXPECT_EQ(readTemperature("Mod2"), failure);
    EXPECT_EQ(readTemperature("Mod1"), 0);
}

TEST_F(FaultTest, AChannelIsFoundInRangesAndAmongOthers) {
    const FaultsInForce faults(oneFault("\"resource\":\"Mod2/ch1\"," + failing));
    const auto voltages = [&](const char* names) {
        return getArray(getDoubles, session, names, "PSU.Voltage").code;
    };
    EXPECT_EQ(voltages("Mod2/ch0:1"), failure);
    EXPECT_EQ(voltages("Mod2/ch0,MOD2/CH1"), failure);
    EXPECT_EQ(get(getDouble, session, "Mod2/ch0", "PSU.Voltage").code, 0);
    EXPECT_EQ(readTemperature("Mod2"), 0);
}

TEST_F(FaultTest, UnknownNamesDoNotHideKnownOnes) {
    const FaultsInForce faults(oneFault("\"resource\":\"Mod2\"," + failing));
    EXPECT_EQ(readTemperature("Nothing,Mod2"), failure);
    EXPECT_EQ(readTemperature("Nothing"), -250956);
    EXPECT_EQ(readTemperature("Mod2/ch5:1"), -250960);
}

TEST_F(FaultTest, TheTokensStandForTheSessionsLists) {
    session.unreserve("Mod5");
    Session other("Mod5", 1);
    const FaultsInForce faults(oneFault("\"resource\":\"Mod5\"," + failing));
    EXPECT_EQ(get(getDouble, other, "$DefaultDevices", "Dev.Temperature").code, failure);
    EXPECT_EQ(get(getDouble, other, "$ReservedDevices", "Dev.Temperature").code, failure);
    EXPECT_EQ(get(getDouble, other, "$ConnectedDevices", "Dev.Temperature").code, -250959);
}

TEST_F(FaultTest, AnOmittedDeviceIsTheDefaultOne) {
    Session other;
    Status opening;
    Handle handle = 0;
    nQITRMCAPI100_initializeSessionWithDevices(&handle, "Bench", 60.0, 1, "", 0.0, &opening);
    const FaultsInForce faults(oneFault("\"resource\":\"Bench\"," + failing));
    Status status;
    char* text = nullptr;
    nQITRMCAPI100_getDevicePropertyString(handle, nullptr, "Dev.ProductName", &text, &status);
    EXPECT_EQ(status.code, failure);
    Status closing;
    nQITRMCAPI100_closeSession(handle, &closing);
    EXPECT_EQ(closing.code, 0);
}

TEST_F(FaultTest, ACallWithoutResourcesMatchesNoResource) {
    const FaultsInForce faults(oneFault("\"resource\":\"Mod1\"," + failing));
    EXPECT_EQ(session.systemList("Sys.Devices").size(), 5u);
}

TEST_F(FaultTest, OpeningASessionOnADeviceMatchesTheDevice) {
    const FaultsInForce faults(oneFault("\"resource\":\"Bench\"," + failing));
    Handle handle = 0;
    Status status;
    nQITRMCAPI100_initializeSessionWithDevices(&handle, "Bench", 60.0, 1, "", 0.0, &status);
    EXPECT_EQ(status.code, failure);
}

TEST_F(FaultTest, ARenamedDeviceKeepsItsFaults) {
    const FaultsInForce faults(
        oneFault("\"function\":\"getGeneric*\",\"resource\":\"Mod5\"," + failing));
    Status status;
    nQITRMCAPI100_renameDevice(session, "Mod5", "Other", &status);
    EXPECT_EQ(readTemperature("Other"), failure);
    Status back;
    nQITRMCAPI100_renameDevice(session, "Other", "Mod5", &back);
    EXPECT_EQ(back.code, 0);
}

TEST_F(FaultTest, ProbabilityIsReproducibleByTheSeed) {
    const auto strikes = [&](const std::string& seed) {
        const FaultsInForce faults(
            "{\"seed\":" + seed +
            ",\"faults\":[{\"probability\":0.25,\"status\":{\"code\":-77}}]}");
        return codesOfReads(400);
    };
    const Codes first = strikes("7");
    EXPECT_EQ(strikes("7"), first);
    EXPECT_NE(strikes("8"), first);
    // Six standard deviations around 100.
    EXPECT_NEAR(std::count(first.begin(), first.end(), failure), 100, 52);
}

TEST_F(FaultTest, FaultsOfOnePlanAreRandomIndependently) {
    const FaultsInForce faults(
        "{\"faults\":[{\"probability\":0.5,\"status\":{\"code\":-1}},"
        "{\"probability\":0.5,\"status\":{\"code\":-2}}]}");
    const Codes codes = codesOfReads(400);
    EXPECT_NEAR(std::count(codes.begin(), codes.end(), -1), 200, 60);
    EXPECT_NEAR(std::count(codes.begin(), codes.end(), -2), 100, 52);
}

TEST_F(FaultTest, ProbabilitiesOf0And1AreExact) {
    FaultsInForce faults(oneFault("\"probability\":0," + failing));
    EXPECT_EQ(codesOfReads(50), Codes(50, 0));
    faults.replace(oneFault("\"probability\":1," + failing));
    EXPECT_EQ(codesOfReads(50), Codes(50, failure));
}

TEST_F(FaultTest, AFailureBeforeTheCallPreventsIt) {
    const FaultsInForce faults(oneFault("\"function\":\"set*\"," + failing));
    EXPECT_EQ(set(setDouble, session, "Mod2/ch0", "PSU.Voltage", 5.0).code, failure);
    EXPECT_EQ(get(getDouble, session, "Mod2/ch0", "PSU.Voltage"), 0.0);
}

TEST_F(FaultTest, AFailureAfterTheCallKeepsItsEffect) {
    const FaultsInForce faults(oneFault("\"function\":\"set*\",\"moment\":\"after\"," + failing));
    EXPECT_EQ(set(setDouble, session, "Mod2/ch0", "PSU.Voltage", 5.0).code, failure);
    EXPECT_EQ(get(getDouble, session, "Mod2/ch0", "PSU.Voltage"), 5.0);
}

TEST_F(FaultTest, AFailureOfTheCallItselfIsKept) {
    FaultsInForce faults(oneFault("\"moment\":\"after\"," + failing));
    EXPECT_EQ(readTemperature("Nothing"), -250956);
    faults.replace(oneFault("\"status\":{\"code\":77}"));
    EXPECT_EQ(readTemperature("Nothing"), -250956);
    faults.replace(oneFault("\"output\":{\"null\":true}"));
    EXPECT_EQ(readTemperature("Nothing"), -250956);
}

TEST_F(FaultTest, AFailureAfterTheCallFreesItsOutputs) {
    const FaultsInForce faults(oneFault("\"moment\":\"after\"," + failing));
    Status status;
    char** names = nullptr;
    std::uint32_t count = 7;
    nQITRMCAPI100_getSystemPropertyStringArray(session, "Sys.Devices", &names, &count, &status);
    EXPECT_EQ(status.code, failure);
    EXPECT_EQ(names, nullptr);
    EXPECT_EQ(count, 0u);
    EXPECT_EQ(getText(session, "Mod1", "Dev.ProductName").value, "");
    EXPECT_EQ(get(getDouble, session, "Mod2", "Dev.Temperature").value, 0.0);
    EXPECT_EQ(getArray(getDoubles, session, "Mod1", "DMM.Readings").value.size(), 0u);
    std::uint8_t bytes[] = {9, 9, 9, 9};
    Status reading;
    nQITRMCAPI100_getNvmemBytes(session, "Mod1/calibration", 1, bytes, 3, &reading);
    EXPECT_EQ(reading.code, failure);
    EXPECT_EQ(std::vector<int>(bytes, bytes + 4), (std::vector<int>{0, 0, 0, 9}));
}

TEST_F(FaultTest, AFailureAfterAnOpeningLeavesNothingOpen) {
    Handle opened = 7;
    {
        const FaultsInForce faults(oneFault("\"moment\":\"after\"," + failing));
        Status status;
        nQITRMCAPI100_initializeSessionWithDevices(&opened, "Bench", 60.0, 3, "", 0.0, &status);
        EXPECT_EQ(status.code, failure);
    }
    EXPECT_EQ(opened, 0u);
    Session next("Bench");
}

TEST_F(FaultTest, AFailureAfterOpeningAPropertyOrCommandClosesItAgain) {
    // The numbers of closed handles are not reused soon, so the next handle shows how many there
    // were. Each of them is tried.
    const auto open = [&](auto function, const char* name) {
        std::uint32_t handle = 0;
        Status status;
        function(session, "Mod1", name, &handle, &status);
        return handle;
    };
    const std::uint32_t property = open(nQITRMCAPI100_openGenericProperty, "DMM.Range");
    const std::uint32_t command = open(nQITRMCAPI100_openGenericCommand, "DMM.Trigger");
    {
        const FaultsInForce faults(
            oneFault("\"function\":\"open*\",\"moment\":\"after\"," + failing));
        EXPECT_EQ(open(nQITRMCAPI100_openGenericProperty, "DMM.Range"), 0u);
        EXPECT_EQ(open(nQITRMCAPI100_openGenericCommand, "DMM.Trigger"), 0u);
    }
    Status ofProperty;
    nQITRMCAPI100_closeProperty(property + 1, &ofProperty);
    EXPECT_EQ(ofProperty.code, -250973);
    Status ofCommand;
    nQITRMCAPI100_closeCommand(command + 1, &ofCommand);
    EXPECT_EQ(ofCommand.code, -250973);
    Status closing;
    nQITRMCAPI100_closeProperty(property, &closing);
    nQITRMCAPI100_closeCommand(command, &closing);
    EXPECT_EQ(closing.code, 0);
}

TEST_F(FaultTest, AWarningDoesNotPreventTheCall) {
    const FaultsInForce faults(oneFault("\"status\":{\"code\":77,\"json\":\"{}\"}"));
    EXPECT_EQ(set(setDouble, session, "Mod2/ch0", "PSU.Voltage", 5.0).code, 77);
    const auto voltage = get(getDouble, session, "Mod2/ch0", "PSU.Voltage");
    EXPECT_EQ(voltage.code, 77);
    EXPECT_EQ(voltage.value, 5.0);
    EXPECT_EQ(getText(session, "Mod1", "Dev.ProductName").value, "Multimeter");
}

TEST_F(FaultTest, AWarningOfTheCallItselfIsReplaced) {
    FaultsInForce faults(oneFault("\"status\":{\"code\":77}"));
    EXPECT_EQ(session.unreserve("Bench"), 77);
    faults.replace(oneFault("\"moment\":\"after\"," + failing));
    EXPECT_EQ(session.unreserve("Bench"), failure);
}

TEST_F(FaultTest, DetailsOfEveryKindAreReported) {
    const FaultsInForce faults(
        oneFault("\"status\":{\"code\":-5,\"constant\":\"kOwn\",\"details\":["
                 "{\"usage\":\"kUsageTypeDevice\",\"value\":\"Mod1\"},{\"elaboration\":\"kA\"},"
                 "{\"header\":\"kB\"},{\"empty\":true},{\"usage\":\"kC\",\"value\":7},"
                 "{\"usage\":\"kD\",\"value\":[\"x\",\"y\"]}],"
                 "\"causes\":[{\"code\":-6,\"causes\":[{\"code\":-7}]}]}"));
    const std::string info =
        "\"component\":\"qitrmcapi\",\"translator\":\"mxlator_qitrmc\",\"translator_info\":{"
        "\"ordered_data\":[";
    EXPECT_EQ(get(getDouble, session, "Mod1", "Dev.Temperature").text,
              "{\"error_constant\":\"kOwn\"," + info + usage("Device", "\"Mod1\"") +
                  ",{\"type\":\"elaboration\",\"usage\":\"kA\"},"
                  "{\"type\":\"header\",\"usage\":\"kB\"},{\"type\":\"empty\"},"
                  "{\"type\":\"usage\",\"usage\":\"kC\",\"value\":7,\"value_type\":\"uint32_t\"},"
                  "{\"type\":\"usage\",\"usage\":\"kD\",\"value\":[\"x\",\"y\"],"
                  "\"value_type\":\"string\"}]},\"nested_error\":{\"code\":-6," +
                  info + "]},\"nested_error\":{\"code\":-7," + info + "]}}}}");
}

TEST_F(FaultTest, ATextThatIsNotJsonIsReportedUnchanged) {
    const FaultsInForce faults(
        oneFault("\"status\":{\"code\":-5,\"json\":\"{\\\"a\\\":[1,\\\" \\\\\"}"));
    EXPECT_EQ(get(getDouble, session, "Mod1", "Dev.Temperature").text, "{\"a\":[1,\" \\");
}

TEST_F(FaultTest, ACallWithANegativeStatusIsNotCounted) {
    const FaultsInForce faults(oneFault("\"calls\":{\"first\":2}," + failing));
    Status dead;
    dead.code = -1;
    double value = 0;
    nQITRMCAPI100_getGenericPropertyDouble(session, "Mod1", "Dev.Temperature", &value, &dead);
    EXPECT_EQ(codesOfReads(2), (Codes{0, failure}));
}

}  // namespace
