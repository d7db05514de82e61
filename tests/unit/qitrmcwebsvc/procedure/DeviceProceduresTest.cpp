#include "support/ProcedureFixture.h"

namespace {

const std::string freeDevices = "freeStringArray(4)";

class DeviceProceduresTest : public ProcedureFixture {
  protected:
    void SetUp() override {
        ProcedureFixture::SetUp();
        openSession();
    }
};

// ---- The methods that take devices --------------------------------------------------------------

struct DevicesCase {
    const char* method;
    const char* onDefault;  // the call without devices
    const char* onTwo;      // the call on Mod1 and Mod2
};

class DevicesTest : public DeviceProceduresTest, public testing::WithParamInterface<DevicesCase> {};

TEST_P(DevicesTest, WithoutDevicesUsesTheDefaultDevices) {
    EXPECT_EQ(ask(GetParam().method), "{}");
    EXPECT_EQ(driver.takeCalls(), Calls{GetParam().onDefault});
}

TEST_P(DevicesTest, AcceptsATextAnArrayOfOneTextAndAnArrayOfSeveral) {
    const Calls expected = {readDevices, freeDevices, GetParam().onTwo};
    EXPECT_EQ(ask(GetParam().method, R"("devices":"Mod1,Mod2")"), "{}");
    EXPECT_EQ(driver.takeCalls(), expected);
    EXPECT_EQ(ask(GetParam().method, R"("devices":["Mod1,Mod2"])"), "{}");
    EXPECT_EQ(driver.takeCalls(), expected);
    EXPECT_EQ(ask(GetParam().method, R"("devices":["Mod1","Mod2"])"), "{}");
    EXPECT_EQ(driver.takeCalls(), expected);
}

TEST_P(DevicesTest, RefusesADeviceThatTheDriverDoesNotKnow) {
    EXPECT_EQ(ask(GetParam().method, R"("devices":["Mod1","Mod9"])"),
              failure(-250828, "kUsageTypeRequestedValue", "Mod9"));
    EXPECT_EQ(driver.takeCalls(), (Calls{readDevices, freeDevices}));
}

TEST_P(DevicesTest, RefusesAnUnknownSession) {
    EXPECT_EQ(request(GetParam().method, R"({"session_id":"_session8"})"),
              failure(-250833, "kUsageTypeSessionId", "_session8"));
    EXPECT_EQ(driver.takeCalls(), Calls{});
}

TEST_P(DevicesTest, PassesTheDriversErrorOn) {
    const std::string call = GetParam().onDefault;
    fail(call, -250999, R"({"from":"driver"})");
    EXPECT_EQ(ask(GetParam().method), "-250999");
    EXPECT_EQ(statusText, R"({"from":"driver"})");
    EXPECT_EQ(driver.takeCalls(), Calls{call});
}

TEST_P(DevicesTest, DropsAWarning) {
    RecordingDriver::Reply warning;
    warning.code = 5;
    driver.reply(GetParam().onDefault, warning);
    EXPECT_EQ(ask(GetParam().method), "{}");
}

INSTANTIATE_TEST_SUITE_P(
    Methods, DevicesTest,
    testing::Values(DevicesCase{"connectToDevices", "connectToDevices(7, \"$DefaultDevices\", -1)",
                                "connectToDevices(7, \"Mod1,Mod2\", -1)"},
                    DevicesCase{"disconnectFromDevices",
                                "disconnectFromDevices(7, \"$DefaultDevices\")",
                                "disconnectFromDevices(7, \"Mod1,Mod2\")"},
                    DevicesCase{"reserveDevices",
                                "reserveDevices(7, \"$DefaultDevices\", 3, \"\", 0)",
                                "reserveDevices(7, \"Mod1,Mod2\", 3, \"\", 0)"},
                    DevicesCase{"unreserveDevices", "unreserveDevices(7, \"$DefaultDevices\")",
                                "unreserveDevices(7, \"Mod1,Mod2\")"},
                    DevicesCase{"resetDevices", "resetDevices(7, \"$DefaultDevices\")",
                                "resetDevices(7, \"Mod1,Mod2\")"}),
    [](const auto& row) { return std::string(row.param.method); });

TEST_F(DeviceProceduresTest, DevicesAreTheDefaultEvenInASessionOnChannels) {
    openSession(R"("physical_channels":"Mod1/ch0")");
    EXPECT_EQ(ask("resetDevices"), "{}");
    EXPECT_EQ(driver.takeCalls(), Calls{"resetDevices(7, \"$DefaultDevices\")"});
}

TEST_F(DeviceProceduresTest, TokensArePassedToTheDriverUnchanged) {
    EXPECT_EQ(ask("connectToDevices", R"("devices":"$ReservedDevices")"), "{}");
    EXPECT_EQ(driver.takeCalls(),
              (Calls{readDevices, freeDevices, "connectToDevices(7, \"$ReservedDevices\", -1)"}));
}

// ---- Reservation --------------------------------------------------------------------------------

TEST_F(DeviceProceduresTest, ReservationPassesAccessGroupAndTimeoutOn) {
    EXPECT_EQ(ask("reserveDevices", R"("devices":"Mod1","access":1,"reservation_group":"g",)"
                                    R"("reservation_timeout":2)"),
              "{}");
    EXPECT_EQ(driver.takeCalls(),
              (Calls{readDevices, freeDevices, "reserveDevices(7, \"Mod1\", 1, \"g\", 2)"}));
    EXPECT_EQ(ask("reserveDevices", R"("reservation_timeout":-0.5)"), "{}");
    EXPECT_EQ(driver.takeCalls(), Calls{"reserveDevices(7, \"$DefaultDevices\", 3, \"\", -0.5)"});
}

TEST_F(DeviceProceduresTest, ReservationGetsTheNumberOfAnAccessWordFromTheDriver) {
    give("translateStaticEnumStringToValue(\"ReservationAccess\", \"ReadOnly\")", std::int64_t{1});
    EXPECT_EQ(ask("reserveDevices", R"("devices":"Mod1","access":"ReadOnly")"), "{}");
    EXPECT_EQ(driver.takeCalls(),
              (Calls{readDevices, freeDevices,
                     "translateStaticEnumStringToValue(\"ReservationAccess\", \"ReadOnly\")",
                     "reserveDevices(7, \"Mod1\", 1, \"\", 0)"}));
}

TEST_F(DeviceProceduresTest, ReservationDoesNotAcceptForce) {
    EXPECT_EQ(ask("reserveDevices", R"("force_reserve":true)"),
              R"(-32602 [{"type":"usage","usage":"kUsageTypeParameter",)"
              R"("value":"#/params/force_reserve","value_type":"string"},)"
              R"({"type":"usage","usage":"kUsageTypeDetails",)"
              R"("value":"This parameter you specified is unsupported.","value_type":"string"}])");
    EXPECT_EQ(driver.takeCalls(), Calls{});
}

TEST_F(DeviceProceduresTest, AReservedDeviceIsReportedWithTheSessionsThatHoldIt) {
    EXPECT_EQ(ask("reserveDevices", R"("devices":"Mod1")"), "{}");
    give("getSessionPropertyStringArray(7, \"Session.ReservedDevices\")", Texts{"Mod1"});
    fail("reserveDevices", -250811);
    EXPECT_EQ(ask("reserveDevices", R"("devices":"Mod1")"),
              R"(-250811 [{"type":"usage","usage":"kUsageTypeReservedBySessions",)"
              R"("value":["_session7"],"value_type":"string"}])");
}

// ---- Renaming -----------------------------------------------------------------------------------

TEST_F(DeviceProceduresTest, RenamingPassesBothNamesOnUnchanged) {
    EXPECT_EQ(ask("renameDevice", R"("device":"$x,Mod1/ch03:4","new_device_name":"Näme")"), "{}");
    EXPECT_EQ(driver.takeCalls(), Calls{"renameDevice(7, \"$x,Mod1/ch03:4\", \"Näme\")"});
}

TEST_F(DeviceProceduresTest, RenamingAnUnknownDeviceIsRefusedByTheDriver) {
    fail("renameDevice", -250807);
    EXPECT_EQ(ask("renameDevice", R"("device":"Mod9","new_device_name":"M")"), "-250807");
    EXPECT_EQ(driver.takeCalls(), Calls{"renameDevice(7, \"Mod9\", \"M\")"});
}

TEST_F(DeviceProceduresTest, RenamingNeedsBothNames) {
    const std::string wanted =
        R"(-32602 [{"type":"usage","usage":"kUsageTypeParameter","value":"#/params",)"
        R"("value_type":"string"},{"type":"usage","usage":"kUsageTypeDetails",)"
        R"("value":"The following parameter(s) is required: session_id, device, new_device_name.",)"
        R"("value_type":"string"}])";
    EXPECT_EQ(ask("renameDevice", R"("device":"Mod1")"), wanted);
    EXPECT_EQ(ask("renameDevice", R"("new_device_name":"M")"), wanted);
    EXPECT_EQ(driver.takeCalls(), Calls{});
}

}  // namespace
