#include "support/ProcedureFixture.h"

namespace {

const std::string needsResource =
    failure(-32602, "kUsageTypeDetails",
            "You must specify at least one of the following parameters: device, physical_channel.");

class CommandsTest : public ProcedureFixture {
  protected:
    void SetUp() override {
        ProcedureFixture::SetUp();
        openSession();
    }
};

// ---- List ---------------------------------------------------------------------------------------

TEST_F(CommandsTest, ListsADevicesCommandsInTheDriversOrder) {
    give("getGenericPropertyStringArray(7, \"Mod1\", \"Dev.Commands\")", Texts{"Zero", "Align"});
    EXPECT_EQ(ask("getCommandList", R"("device":"Mod1")"), R"({"commands":["Zero","Align"]})");
    EXPECT_EQ(driver.takeCalls(),
              (Calls{readDevices, "freeStringArray(4)",
                     "getGenericPropertyStringArray(7, \"Mod1\", \"Dev.Commands\")",
                     "freeStringArray(2)"}));
}

TEST_F(CommandsTest, ListsAChannelsCommands) {
    give("getGenericPropertyStringArray(7, \"Mod1/ch0\", \"PhysChan.Commands\")", Texts{"Trim"});
    EXPECT_EQ(ask("getCommandList", R"("physical_channel":"Mod1/ch0")"),
              R"({"commands":["Trim"]})");
}

TEST_F(CommandsTest, ListsTheCommandsOfTheDefaultResources) {
    openSession(R"("devices":"Mod1")");
    give("getGenericPropertyStringArray(7, \"$DefaultDevices\", \"Dev.Commands\")", Texts{});
    EXPECT_EQ(ask("getCommandList"), R"({"commands":[]})");
}

TEST_F(CommandsTest, ARefusedListFailsTheMethod) {
    RecordingDriver::Reply refusal;
    refusal.value = Texts{"Zero"};
    refusal.code = -250999;
    driver.reply("getGenericPropertyStringArray(7, \"Mod1\", \"Dev.Commands\")", refusal);
    EXPECT_EQ(ask("getCommandList", R"("device":"Mod1")"), "-250999");
    EXPECT_EQ(driver.calls().back(), "freeStringArray(1)");
}

TEST_F(CommandsTest, ASessionOnNvmemAreasHasNoCommandsToList) {
    openSession(R"("nvmem_areas":"Mod1/user")");
    EXPECT_EQ(ask("getCommandList"), needsResource);
    EXPECT_EQ(driver.takeCalls(), Calls{});
}

TEST_F(CommandsTest, ASessionWithoutResourcesMustNameOne) {
    EXPECT_EQ(ask("getCommandList"), needsResource);
}

TEST_F(CommandsTest, ListAcceptsADeviceOrAChannelButNotBoth) {
    EXPECT_EQ(ask("getCommandList", R"("device":"Mod1","physical_channel":"Mod1/ch0")"),
              R"(-32602 [{"type":"usage","usage":"kUsageTypeParameter","value":"#/params",)"
              R"("value_type":"string"},{"type":"usage","usage":"kUsageTypeDetails",)"
              R"("value":"You must specify none or only one of the following parameters: device, )"
              R"(physical_channel.","value_type":"string"}])");
}

// ---- Execution ----------------------------------------------------------------------------------

TEST_F(CommandsTest, ExecutionHasATimeoutOfTenSecondsByDefault) {
    EXPECT_EQ(ask("executeCommand", R"("command":"Zero","devices":["Mod1","Mod2"])"), "{}");
    EXPECT_EQ(driver.takeCalls(), (Calls{readDevices, "freeStringArray(4)",
                                         "executeGenericCommand(7, \"Mod1,Mod2\", \"Zero\", 10)"}));
}

TEST_F(CommandsTest, ExecutionPassesAnyTimeoutOnUnchanged) {
    for (const char* timeout : {"0", "0.25", "4294967296"}) {
        EXPECT_EQ(ask("executeCommand",
                      R"("command":"Zero","devices":"Mod1","timeout":)" + std::string(timeout)),
                  "{}");
        EXPECT_EQ(driver.calls().back(),
                  "executeGenericCommand(7, \"Mod1\", \"Zero\", " + std::string(timeout) + ")");
    }
}

TEST_F(CommandsTest, ExecutionWithoutAnyResourceIsLeftToTheDriver) {
    EXPECT_EQ(ask("executeCommand", R"("command":"Zero")"), "{}");
    EXPECT_EQ(driver.takeCalls(), Calls{"executeGenericCommand(7, \"\", \"Zero\", 10)"});
    fail("executeGenericCommand", -250999);
    EXPECT_EQ(ask("executeCommand", R"("command":"Zero")"), "-250999");
}

TEST_F(CommandsTest, ExecutionOnTheDefaultAreasIsLeftToTheDriver) {
    openSession(R"("nvmem_areas":"Mod1/user")");
    EXPECT_EQ(ask("executeCommand", R"("command":"Zero")"), "{}");
    EXPECT_EQ(driver.takeCalls(),
              Calls{"executeGenericCommand(7, \"$DefaultNVMEMAreas\", \"Zero\", 10)"});
}

TEST_F(CommandsTest, ANegativeTimeoutIsRefusedByTheSchema) {
    EXPECT_EQ(ask("executeCommand", R"("command":"Zero","timeout":-1)"),
              R"(-32602 [{"type":"usage","usage":"kUsageTypeParameter","value":"#/params/timeout",)"
              R"("value_type":"string"},{"type":"usage","usage":"kUsageTypeDetails",)"
              R"("value":"The number must be greater than or equal to 0","value_type":"string"}])");
}

// ---- Information --------------------------------------------------------------------------------

TEST_F(CommandsTest, InformationKeepsEmptyTextsAndCallsInThisOrder) {
    give("getCommandPropertyString(31, \"Cmd.Descr\")", std::string());
    give("getCommandPropertyString(31, \"Cmd.Doc\")", std::string("Zeroes."));
    EXPECT_EQ(ask("getCommandInformation", R"("command":"Zero","device":"Mod1")"),
              R"({"description":"","document":"Zeroes."})");
    EXPECT_EQ(
        driver.takeCalls(),
        (Calls{readDevices, "freeStringArray(4)", "openGenericCommand(7, \"Mod1\", \"Zero\")",
               "getCommandPropertyString(31, \"Cmd.Descr\")", "freeString()",
               "getCommandPropertyString(31, \"Cmd.Doc\")", "freeString()", "closeCommand(31)"}));
}

TEST_F(CommandsTest, AFailingAttributeStillClosesTheCommand) {
    give("getCommandPropertyString(31, \"Cmd.Descr\")", std::string("d"));
    fail("getCommandPropertyString(31, \"Cmd.Doc\")", -250999, R"({"from":"driver"})");
    fail("closeCommand", -250998);
    EXPECT_EQ(ask("getCommandInformation", R"("command":"Zero","device":"Mod1")"), "-250999");
    EXPECT_EQ(statusText, R"({"from":"driver"})");
    EXPECT_EQ(driver.calls().back(), "closeCommand(31)");
}

TEST_F(CommandsTest, AFailingCloseIsNotReportedToTheClient) {
    give("getCommandPropertyString", std::string("d"));
    fail("closeCommand", -250998);
    EXPECT_EQ(ask("getCommandInformation", R"("command":"Zero","device":"Mod1")"),
              R"({"description":"d","document":"d"})");
}

TEST_F(CommandsTest, ANullAttributeIsAnInternalErrorAndStillClosesTheCommand) {
    give("getCommandPropertyString(31, \"Cmd.Descr\")", std::string("d"));
    EXPECT_EQ(ask("getCommandInformation", R"("command":"Zero","device":"Mod1")"),
              internalError("Fail to get command information."));
    EXPECT_EQ(driver.calls().back(), "closeCommand(31)");
}

TEST_F(CommandsTest, ACommandThatCannotBeOpenedIsNotClosed) {
    fail("openGenericCommand", -250999);
    EXPECT_EQ(ask("getCommandInformation", R"("command":"Nothing","device":"Mod1")"), "-250999");
    EXPECT_EQ(driver.calls().back(), "openGenericCommand(7, \"Mod1\", \"Nothing\")");
}

}  // namespace
