#include <limits>

#include "Values.h"

using namespace drivertest;

namespace {

using PropertyTest = BenchTest;

TEST_F(PropertyTest, ScalarsOfEachTypeAreRead) {
    EXPECT_EQ(get(getBool, session, "Mod1", "DMM.AutoRange"), std::uint8_t{1});
    EXPECT_EQ(get(getDouble, session, "Mod1", "DMM.Range"), 10.0);
    EXPECT_EQ(get(getInt32, session, "Mod1", "DMM.Offset"), 0);
    EXPECT_EQ(get(getInt64, session, "Mod1", "DMM.TriggerDelay"), std::int64_t{0});
    EXPECT_EQ(getText(session, "Mod1", "Dev.ProductName"), std::string("Multimeter"));
    EXPECT_EQ(get(getUInt32, session, "Mod1", "Dev.ProductNum"), 5110u);
    EXPECT_EQ(get(getUInt64, session, "Mod1", "DMM.TriggerCount"), std::uint64_t{0});
}

TEST_F(PropertyTest, ArraysOfEachTypeAreRead) {
    EXPECT_EQ(getArray(getBools, session, "Mod1", "DMM.InputsInUse"),
              (std::vector<std::uint8_t>{1, 1, 0, 0}));
    EXPECT_EQ(getArray(getDoubles, session, "Mod1", "DMM.Readings"),
              (std::vector<double>{0.5, -0.25, 1.75}));
    EXPECT_EQ(getArray(getInt32s, session, "Mod1", "DMM.Trims"),
              (std::vector<std::int32_t>{0, -1, 2, -3}));
    EXPECT_EQ(getArray(getInt64s, session, "Mod1", "DMM.Timestamps"),
              (std::vector<std::int64_t>{-1, 0, std::numeric_limits<std::int64_t>::max()}));
    EXPECT_EQ(getTexts(session, "Mod1", "DMM.Labels"), (Names{"A", "B", "C", "D"}));
    EXPECT_EQ(getArray(getUInt32s, session, "Mod1", "DMM.Histogram"),
              (std::vector<std::uint32_t>{0, 1, 4294967295u}));
    EXPECT_EQ(getArray(getUInt64s, session, "Mod1", "DMM.Totals"),
              (std::vector<std::uint64_t>{0, 18446744073709551615u}));
}

TEST_F(PropertyTest, AnEmptyArrayIsNullWithCountZero) {
    EXPECT_EQ(getTexts(session, "Mod5", "SW.Routes"), Names());
}

TEST_F(PropertyTest, ScalarsAreWritten) {
    EXPECT_EQ(set(setBool, session, "Mod1", "DMM.AutoRange", std::uint8_t{0}).code, 0);
    EXPECT_EQ(get(getBool, session, "Mod1", "DMM.AutoRange"), std::uint8_t{0});
    EXPECT_EQ(set(setDouble, session, "Mod1", "DMM.Range", 0.1).code, 0);
    EXPECT_EQ(get(getDouble, session, "Mod1", "DMM.Range"), 0.1);
    EXPECT_EQ(set(setInt32, session, "Mod1", "DMM.Offset", -1000).code, 0);
    EXPECT_EQ(get(getInt32, session, "Mod1", "DMM.Offset"), -1000);
    EXPECT_EQ(set(setInt64, session, "Mod1", "DMM.TriggerDelay", std::int64_t{-5000000000}).code,
              0);
    EXPECT_EQ(get(getInt64, session, "Mod1", "DMM.TriggerDelay"), std::int64_t{-5000000000});
    EXPECT_EQ(set(setText, session, "Mod1", "DMM.Note", "für später").code, 0);
    EXPECT_EQ(getText(session, "Mod1", "DMM.Note"), std::string("für später"));
    EXPECT_EQ(set(setUInt32, session, "Mod1", "DMM.SampleCount", 1000000u).code, 0);
    EXPECT_EQ(get(getUInt32, session, "Mod1", "DMM.SampleCount"), 1000000u);
}

TEST_F(PropertyTest, ArraysAreWrittenWhole) {
    const std::vector<std::uint8_t> flags{0, 7, 255};
    EXPECT_EQ(setArray(setBools, session, "Mod1", "DMM.InputsInUse", flags).code, 0);
    EXPECT_EQ(getArray(getBools, session, "Mod1", "DMM.InputsInUse"),
              (std::vector<std::uint8_t>{0, 1, 1}));
    EXPECT_EQ(setArray(setInt32s, session, "Mod1", "DMM.Trims", {127, -128}).code, 0);
    EXPECT_EQ(getArray(getInt32s, session, "Mod1", "DMM.Trims"),
              (std::vector<std::int32_t>{127, -128}));
    EXPECT_EQ(setArray(setTexts, session, "Mod1", "DMM.Labels", {"x", ""}).code, 0);
    EXPECT_EQ(getTexts(session, "Mod1", "DMM.Labels"), (Names{"x", ""}));
    EXPECT_EQ(setArray(setTexts, session, "Mod1", "DMM.Labels", {}).code, 0);
    EXPECT_EQ(getTexts(session, "Mod1", "DMM.Labels"), Names());
}

TEST_F(PropertyTest, AScalarOfSeveralResourcesIsAnArray) {
    EXPECT_EQ(setArray(setDoubles, session, "Mod2/ch0:1", "PSU.Voltage", {5.0, 12.0}).code, 0);
    EXPECT_EQ(getArray(getDoubles, session, "Mod2/ch0:1", "PSU.Voltage"),
              (std::vector<double>{5.0, 12.0}));
    EXPECT_EQ(get(getDouble, session, "Mod2/ch1", "PSU.Voltage"), 12.0);
    EXPECT_EQ(getArray(getUInt32s, session, "Mod4,Mod1,Mod4", "Dev.SlotNum"),
              (std::vector<std::uint32_t>{4, 1, 4}));
    EXPECT_EQ(getTexts(session, "Mod1,Mod2", "Dev.ProductName"),
              (Names{"Multimeter", "Power supply"}));
}

TEST_F(PropertyTest, TokensStandForSeveralResources) {
    EXPECT_EQ(getArray(getUInt32s, session, "$DefaultDevices", "Dev.SlotNum"),
              (std::vector<std::uint32_t>{1, 2, 4, 5}));
}

TEST_F(PropertyTest, SeveralResourcesNeedOneElementEach) {
    const Outcome outcome =
        setArray(setDoubles, session, "Mod2/ch0:1", "PSU.Voltage", {1.0, 2.0, 3.0});
    EXPECT_EQ(outcome.code, -250967);
    EXPECT_EQ(outcome.text, detailsOf("wrongElementCount",
                                      usage("PropertyName", "\"PSU.Voltage\"") +
                                          ",{\"type\":\"usage\",\"usage\":\"kUsageTypeValueCount\","
                                          "\"value\":3,\"value_type\":\"uint32_t\"}"));
}

TEST_F(PropertyTest, OneBadElementPreventsTheWholeWrite) {
    EXPECT_EQ(setArray(setDoubles, session, "Mod2/ch0:1", "PSU.Voltage", {1.0, 31.0}).code,
              -250971);
    EXPECT_EQ(getArray(getDoubles, session, "Mod2/ch0:1", "PSU.Voltage"),
              (std::vector<double>{0.0, 0.0}));
}

TEST_F(PropertyTest, AnArrayPropertyIsNotSpreadOverResources) {
    EXPECT_EQ(getTexts(session, "Mod1,Mod2", "Dev.PhysChans").code, -250966);
    EXPECT_EQ(get(getUInt32, session, "Mod1,Mod2", "Dev.SlotNum").code, -250966);
}

TEST_F(PropertyTest, AnotherTypeIsRefusedWithTheRightOne) {
    const auto answer = get(getInt32, session, "Mod1", "DMM.Range");
    EXPECT_EQ(answer.code, -250965);
    EXPECT_EQ(answer.text,
              detailsOf("wrongPropertyType", usage("PropertyName", "\"DMM.Range\"") + "," +
                                                 usage("DataType", "\"Double\"")));
    EXPECT_EQ(getArray(getDoubles, session, "Mod1", "DMM.Range").code, -250965);
    EXPECT_EQ(get(getDouble, session, "Mod1", "DMM.Readings").code, -250965);
    EXPECT_EQ(set(setUInt32, session, "Mod1", "DMM.Offset", 1u).code, -250965);
}

TEST_F(PropertyTest, AnUnknownPropertyIsRefusedWithItsResource) {
    const auto answer = get(getDouble, session, "mod2", "DMM.Range");
    EXPECT_EQ(answer.code, -250964);
    EXPECT_EQ(answer.text,
              detailsOf("unknownProperty", usage("PropertyName", "\"DMM.Range\"") + "," +
                                               usage("ResourceName", "\"Mod2\"")));
    EXPECT_EQ(get(getDouble, session, "Mod1", "dmm.range").code, -250964);
    EXPECT_EQ(get(getDouble, session, "Mod1,Mod2", "DMM.Range").code, -250964);
    EXPECT_EQ(getTexts(session, "Mod1", "Dev.Modules").code, -250964);
    EXPECT_EQ(get(getUInt32, session, "Bench", "Dev.SlotNum").code, -250964);
}

TEST_F(PropertyTest, AMisspeltPropertyIsRefusedWithTheNearestName) {
    const auto refusal = [](const char* given, const std::string& more) {
        return detailsOf("unknownProperty",
                         usage("PropertyName", "\"" + std::string(given) + "\"") + "," + more);
    };
    const std::string module = usage("ResourceName", "\"Mod1\"") + ",";
    EXPECT_EQ(get(getDouble, session, "Mod1", "DMM.Rnage").text,
              refusal("DMM.Rnage", module + usage("NearestName", "\"DMM.Range\"")));
    EXPECT_EQ(get(getDouble, session, "Mod1", "dmm.range").text,
              refusal("dmm.range", module + usage("NearestName", "\"DMM.Range\"")));
    // Of those that the driver computes too, but not of those that the resource lacks.
    EXPECT_EQ(get(getUInt32, session, "Mod1", "Dev.SlotNumber").text,
              refusal("Dev.SlotNumber", module + usage("NearestName", "\"Dev.SlotNum\"")));
    EXPECT_EQ(get(getUInt32, session, "Mod1", "Far.From.Everything").text,
              refusal("Far.From.Everything", usage("ResourceName", "\"Mod1\"")));
    Status status;
    char** names = nullptr;
    std::uint32_t count = 0;
    nQITRMCAPI100_getSystemPropertyStringArray(session, "Sys.Device", &names, &count, &status);
    EXPECT_EQ(status.text(), refusal("Sys.Device", usage("NearestName", "\"Sys.Devices\"")));
    Status opening;
    nQITRMCAPI100_Property property = 0;
    nQITRMCAPI100_openDriverDefinedProperty(session, "Dev.Coment", &property, &opening);
    EXPECT_EQ(opening.text(), refusal("Dev.Coment", usage("NearestName", "\"Dev.Comment\"")));
}

TEST_F(PropertyTest, ResourcesMustBeNamed) {
    EXPECT_EQ(get(getDouble, session, "", "DMM.Range").code, -250959);
    EXPECT_EQ(get(getDouble, session, "Mod9", "DMM.Range").code, -250956);
    EXPECT_EQ(get(getDouble, session, "Mod1/ch9", "DMM.Range").code, -250957);
    EXPECT_EQ(get(getDouble, session, nullptr, "DMM.Range").code, -250954);
    EXPECT_EQ(get(getDouble, session, "Mod1", nullptr).code, -250954);
}

TEST_F(PropertyTest, AReadOnlyPropertyIsNotWritten) {
    const Outcome outcome = set(setUInt64, session, "Mod1", "DMM.TriggerCount", std::uint64_t{1});
    EXPECT_EQ(outcome.code, -250968);
    EXPECT_EQ(outcome.text,
              detailsOf("readOnlyProperty", usage("PropertyName", "\"DMM.TriggerCount\"") + "," +
                                                usage("ResourceName", "\"Mod1\"")));
    EXPECT_EQ(set(setUInt32, session, "Mod1", "Dev.SlotNum", 3u).code, -250968);
}

TEST_F(PropertyTest, AWriteOnlyPropertyIsNotRead) {
    EXPECT_EQ(set(setText, session, "Mod1", "DMM.UnlockCode", "sesame").code, 0);
    const auto answer = getText(session, "Mod1", "DMM.UnlockCode");
    EXPECT_EQ(answer.code, -250969);
    EXPECT_EQ(answer.value, "");
}

TEST_F(PropertyTest, AValueOutsideItsEnumerationIsRefused) {
    EXPECT_EQ(set(setInt32, session, "Mod1", "DMM.Function", 10).code, 0);
    const Outcome outcome = set(setInt32, session, "Mod1", "DMM.Function", 3);
    EXPECT_EQ(outcome.code, -250970);
    EXPECT_EQ(outcome.text,
              detailsOf("valueNotEnumerated",
                        usage("PropertyName", "\"DMM.Function\"") + "," +
                            usage("ResourceName", "\"Mod1\"") +
                            ",{\"type\":\"usage\",\"usage\":\"kUsageTypeRequestedValue\","
                            "\"value\":3,\"value_type\":{\"type\":\"enum\",\"id\":4096}}," +
                            usage("AllowedValues",
                                  "[\"Voltage (0)\",\"Current (1)\",\"Resistance (2)\","
                                  "\"Temperature (10)\"]")));
    EXPECT_EQ(get(getInt32, session, "Mod1", "DMM.Function"), 10);
}

TEST_F(PropertyTest, AValueOutOfRangeIsRefusedWithTheLimits) {
    const Outcome outcome = set(setDouble, session, "Mod2/ch0", "PSU.Voltage", 30.5);
    EXPECT_EQ(outcome.code, -250971);
    EXPECT_EQ(outcome.text,
              detailsOf("valueOutOfRange", usage("PropertyName", "\"PSU.Voltage\"") + "," +
                                               usage("ResourceName", "\"Mod2/ch0\"") + "," +
                                               usage("RequestedValue", "\"30.5\"") + "," +
                                               usage("MinimumValue", "\"0\"") + "," +
                                               usage("MaximumValue", "\"30\"")));
    EXPECT_EQ(set(setDouble, session, "Mod2/ch0", "PSU.Voltage", -0.5).code, -250971);
    EXPECT_EQ(set(setDouble, session, "Mod2/ch0", "PSU.Voltage", 30.0).code, 0);
    EXPECT_EQ(
        set(setDouble, session, "Mod2/ch0", "PSU.Voltage", std::numeric_limits<double>::quiet_NaN())
            .code,
        -250971);
    EXPECT_EQ(setArray(setInt32s, session, "Mod1", "DMM.Trims", {0, 128}).code, -250971);
}

TEST_F(PropertyTest, ANullArrayIsRefusedUnlessItIsEmpty) {
    Status status;
    nQITRMCAPI100_setGenericPropertyInt32Array(session, "Mod1", "DMM.Trims", nullptr, 1, &status);
    EXPECT_EQ(status.code, -250954);
    Status text;
    nQITRMCAPI100_setGenericPropertyString(session, "Mod1", "DMM.Note", nullptr, &text);
    EXPECT_EQ(text.code, -250954);
}

TEST_F(PropertyTest, APropertyThatNeedsACommitChangesAtTheCommit) {
    EXPECT_EQ(set(setDouble, session, "Mod2/ch0", "PSU.CurrentLimit", 2.5).code, 0);
    EXPECT_EQ(get(getDouble, session, "Mod2/ch0", "PSU.CurrentLimit"), 0.1);
    Status status;
    nQITRMCAPI100_commitPropertiesGeneric(session, "Mod2/ch1", &status);
    EXPECT_EQ(get(getDouble, session, "Mod2/ch0", "PSU.CurrentLimit"), 0.1);
    nQITRMCAPI100_commitPropertiesGeneric(session, "Mod2/ch0", &status);
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(get(getDouble, session, "Mod2/ch0", "PSU.CurrentLimit"), 2.5);
}

TEST_F(PropertyTest, CommittingADeviceCommitsItsChannels) {
    EXPECT_EQ(set(setDouble, session, "Mod2/ch1", "PSU.CurrentLimit", 1.5).code, 0);
    Status status;
    nQITRMCAPI100_commitPropertiesGeneric(session, "Mod2", &status);
    EXPECT_EQ(get(getDouble, session, "Mod2/ch1", "PSU.CurrentLimit"), 1.5);
}

TEST_F(PropertyTest, ClosingASessionDropsItsUncommittedChanges) {
    session.unreserve("Mod1");
    Session writer("Mod1");
    EXPECT_EQ(set(setDouble, writer, "Mod1", "DMM.ApertureTime", 1.0).code, 0);
    writer.close();
    Status status;
    nQITRMCAPI100_commitPropertiesGeneric(session, "Mod1", &status);
    EXPECT_EQ(get(getDouble, session, "Mod1", "DMM.ApertureTime"), 0.02);
}

TEST_F(PropertyTest, AnotherSessionsDeviceIsReadAndNotWritten) {
    Session other;
    EXPECT_EQ(get(getDouble, other, "Mod1", "DMM.Range"), 10.0);
    const Outcome outcome = set(setDouble, other, "Mod1", "DMM.Range", 1.0);
    EXPECT_EQ(outcome.code, -250811);
    EXPECT_EQ(outcome.text, detailsOf("deviceReserved", usage("Device", "\"Mod1\"")));
    Status status;
    nQITRMCAPI100_commitPropertiesGeneric(other, "Mod1", &status);
    EXPECT_EQ(status.code, -250811);
}

TEST_F(PropertyTest, AReadOnlyReservationDoesNotAllowWriting) {
    EXPECT_EQ(session.reserve("Mod1", 1), 0);
    const Outcome outcome = set(setDouble, session, "Mod1", "DMM.Range", 1.0);
    EXPECT_EQ(outcome.code, -250972);
    EXPECT_EQ(outcome.text,
              detailsOf("readOnlyReservation",
                        "{\"type\":\"elaboration\",\"usage\":\"kAuxTermOperationNotAllowed\"}," +
                            usage("Device", "\"Mod1\"")));
}

TEST_F(PropertyTest, AnUnreservedDeviceMayBeWritten) {
    session.unreserve("Mod1");
    Session other;
    EXPECT_EQ(set(setDouble, other, "Mod1", "DMM.Range", 1.0).code, 0);
}

TEST_F(PropertyTest, SystemPropertiesOfEachTypeAreReadAndWritten) {
    Status status;
    std::uint8_t flag = 7;
    nQITRMCAPI100_getSystemPropertyBool(session, "Sys.Simulated", &flag, &status);
    EXPECT_EQ(flag, 1);
    double interval = 0;
    nQITRMCAPI100_setSystemPropertyDouble(session, "Sys.DiscoveryInterval", 60.0, &status);
    nQITRMCAPI100_getSystemPropertyDouble(session, "Sys.DiscoveryInterval", &interval, &status);
    EXPECT_EQ(interval, 60.0);
    nQITRMCAPI100_setSystemPropertyBool(session, "Sys.DiscoveryEnabled", 0, &status);
    nQITRMCAPI100_getSystemPropertyBool(session, "Sys.DiscoveryEnabled", &flag, &status);
    EXPECT_EQ(flag, 0);
    nQITRMCAPI100_setSystemPropertyBool(session, "Sys.DiscoveryEnabled", 1, &status);
    nQITRMCAPI100_setSystemPropertyDouble(session, "Sys.DiscoveryInterval", 30.0, &status);
    EXPECT_EQ(status.code, 0) << status.text();
}

TEST_F(PropertyTest, SystemPropertiesAreRefusedLikeOthers) {
    Status unknown;
    std::uint8_t flag = 7;
    nQITRMCAPI100_getSystemPropertyBool(session, "Sys.Nothing", &flag, &unknown);
    EXPECT_EQ(unknown.code, -250964);
    EXPECT_EQ(flag, 0);
    Status readOnly;
    nQITRMCAPI100_setSystemPropertyBool(session, "Sys.Simulated", 0, &readOnly);
    EXPECT_EQ(readOnly.code, -250968);
    Status range;
    nQITRMCAPI100_setSystemPropertyDouble(session, "Sys.DiscoveryInterval", 0.5, &range);
    EXPECT_EQ(range.code, -250971);
    Status type;
    std::uint64_t number = 7;
    nQITRMCAPI100_getSystemPropertyUInt64(session, "Sys.Simulated", &number, &type);
    EXPECT_EQ(type.code, -250965);
    EXPECT_EQ(number, 0u);
}

TEST_F(PropertyTest, SessionPropertiesBelongToOneSession) {
    Session other;
    Status status;
    nQITRMCAPI100_setSessionPropertyDouble(session, "Session.Timeout", 2.5, &status);
    double mine = 0;
    double others = 0;
    nQITRMCAPI100_getSessionPropertyDouble(session, "Session.Timeout", &mine, &status);
    nQITRMCAPI100_getSessionPropertyDouble(other, "Session.Timeout", &others, &status);
    EXPECT_EQ(status.code, 0) << status.text();
    EXPECT_EQ(mine, 2.5);
    EXPECT_EQ(others, 10.0);
}

TEST_F(PropertyTest, ATextOfTheSessionIsWrittenThroughTheGenericFunction) {
    EXPECT_EQ(set(setText, session, "", "Session.Comment", "mine").code, 0);
    EXPECT_EQ(getText(session, "Mod1", "Session.Comment"), std::string("mine"));
}

TEST_F(PropertyTest, DefaultsOfASessionCanBeChanged) {
    const char* const devices[] = {"mod4", "Mod1"};
    Status status;
    nQITRMCAPI100_setSessionPropertyStringArray(session, "Session.DefaultDevices", devices, 2,
                                                &status);
    const char* const channels[] = {"Mod1/ch0:1"};
    nQITRMCAPI100_setSessionPropertyStringArray(session, "Session.DefaultPhysChans", channels, 1,
                                                &status);
    const char* const areas[] = {"Mod1/user"};
    nQITRMCAPI100_setSessionPropertyStringArray(session, "Session.DefaultNVMEMAreas", areas, 1,
                                                &status);
    EXPECT_EQ(status.code, 0) << status.text();
    EXPECT_EQ(session.list("Session.DefaultDevices"), (Names{"Mod4", "Mod1"}));
    EXPECT_EQ(session.list("Session.DefaultPhysChans"), (Names{"Mod1/ch0", "Mod1/ch1"}));
    EXPECT_EQ(session.list("Session.DefaultNVMEMAreas"), Names{"Mod1/user"});
    const char* const unknown[] = {"Mod3"};
    Status refused;
    nQITRMCAPI100_setSessionPropertyStringArray(session, "Session.DefaultDevices", unknown, 1,
                                                &refused);
    EXPECT_EQ(refused.code, -250956);
    EXPECT_EQ(session.list("Session.DefaultDevices"), (Names{"Mod4", "Mod1"}));
    Status readOnly;
    nQITRMCAPI100_setSessionPropertyStringArray(session, "Session.ReservedDevices", unknown, 1,
                                                &readOnly);
    EXPECT_EQ(readOnly.code, -250968);
}

TEST_F(PropertyTest, AResourceListsItsOwnPropertiesInOrder) {
    EXPECT_EQ(getTexts(session, "Mod4", "Dev.Properties"),
              (Names{"DIG.SampleRate", "DIG.RecordLength"}));
    EXPECT_EQ(getTexts(session, "Mod2", "Dev.Properties"), Names());
    EXPECT_EQ(getTexts(session, "Mod2/ch1", "PhysChan.Properties"),
              (Names{"PSU.Voltage", "PSU.CurrentLimit", "PSU.OutputEnabled", "PSU.MeasuredVoltage",
                     "PSU.MeasuredCurrent"}));
}

TEST_F(PropertyTest, TheChassisKnowsItsModulesAndItsAddress) {
    EXPECT_EQ(getTexts(session, "Bench", "Dev.Modules"), (Names{"Mod1", "Mod2", "Mod4", "Mod5"}));
    EXPECT_EQ(get(getInt32, session, "Bench", "Dev.ProductCategory"), 1);
    EXPECT_EQ(get(getInt32, session, "Mod5", "Dev.ProductCategory"), 5);
    EXPECT_EQ(getText(session, "Bench", "Dev.TCPIP.EthernetIP"), std::string("192.0.2.10"));
    EXPECT_EQ(getText(session, "Bench", "Dev.TCPIP.Hostname"), std::string("bench"));
    EXPECT_EQ(getText(session, "Mod1", "Dev.TCPIP.Hostname").code, -250964);
}

TEST_F(PropertyTest, AreasHavePropertiesThatDescribeThem) {
    EXPECT_EQ(get(getUInt32, session, "Mod1/calibration", "NVMEMArea.Size"), 1024u);
    EXPECT_EQ(get(getBool, session, "Mod1/calibration", "NVMEMArea.PasswordWanted"),
              std::uint8_t{1});
    EXPECT_EQ(get(getBool, session, "Mod1/user", "NVMEMArea.SerialNumWanted"), std::uint8_t{0});
    EXPECT_EQ(get(getBool, session, "Mod5/calibration", "NVMEMArea.Writable"), std::uint8_t{0});
}

TEST_F(PropertyTest, ATextOfADeviceIsReadDirectly) {
    Status status;
    char* text = nullptr;
    nQITRMCAPI100_getDevicePropertyString(session, "bench", "Dev.TCPIP.Hostname", &text, &status);
    EXPECT_STREQ(text, "bench");
    nQITRMCAPI100_freeString(text);
    Status channel;
    nQITRMCAPI100_getDevicePropertyString(session, "Mod1/ch0", "PhysChan.Comment", &text, &channel);
    EXPECT_EQ(channel.code, -250956);
    EXPECT_EQ(text, nullptr);
}

TEST_F(PropertyTest, ANullDeviceIsTheSessionsDefault) {
    Session onBench("Bench");
    Status status;
    char* text = nullptr;
    nQITRMCAPI100_getDevicePropertyString(onBench, nullptr, "Dev.TCPIP.Hostname", &text, &status);
    EXPECT_STREQ(text, "bench");
    nQITRMCAPI100_freeString(text);
    Status several;
    nQITRMCAPI100_getDevicePropertyString(session, nullptr, "Dev.Name", &text, &several);
    EXPECT_EQ(several.code, -250966);
    EXPECT_EQ(several.text(),
              detailsOf("severalResources",
                        usage("ResourceName", "[\"Mod1\",\"Mod2\",\"Mod4\",\"Mod5\"]")));
    Session none;
    Status missing;
    nQITRMCAPI100_getDevicePropertyString(none, nullptr, "Dev.Name", &text, &missing);
    EXPECT_EQ(missing.code, -250959);
}

TEST_F(PropertyTest, AnArrayOfTheCallerMayBeFreedToo) {
    nQITRMCAPI100_freeArray(std::malloc(8));
    nQITRMCAPI100_freeArray(nullptr);
    nQITRMCAPI100_freeString(nullptr);
    nQITRMCAPI100_freeStringArray(nullptr, 0);
}

}  // namespace
