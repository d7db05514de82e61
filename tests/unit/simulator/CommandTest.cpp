#include "Values.h"

using namespace drivertest;

namespace {

using CommandTest = BenchTest;

TEST_F(CommandTest, ResourcesListTheirCommands) {
    EXPECT_EQ(getTexts(session, "Mod1", "Dev.Commands"),
              (Names{"DMM.SelfTest", "DMM.Trigger", "DMM.Calibrate", "DMM.Defaults"}));
    EXPECT_EQ(getTexts(session, "Mod2/ch0", "PhysChan.Commands"),
              (Names{"PSU.On", "PSU.Off", "PSU.Calibrate"}));
    EXPECT_EQ(getTexts(session, "Mod4/ch0", "PhysChan.Commands"), Names());
}

TEST_F(CommandTest, ACommandActsOnItsResource) {
    EXPECT_EQ(execute(session, "Mod2/ch1", "PSU.On", 0.0).code, 0);
    EXPECT_EQ(getArray(getBools, session, "Mod2/ch0:1", "PSU.OutputEnabled"),
              (std::vector<std::uint8_t>{0, 1}));
}

TEST_F(CommandTest, ACommandActsOnEachResourceOnce) {
    EXPECT_EQ(execute(session, "Mod1,mod1", "DMM.Trigger", 0.0).code, 0);
    EXPECT_EQ(get(getUInt64, session, "Mod1", "DMM.TriggerCount"), std::uint64_t{1});
    EXPECT_EQ(execute(session, "Mod2/ch0:1", "PSU.On", 0.0).code, 0);
    EXPECT_EQ(getArray(getBools, session, "Mod2/ch0:1", "PSU.OutputEnabled"),
              (std::vector<std::uint8_t>{1, 1}));
}

TEST_F(CommandTest, ACommandMayResetSettings) {
    EXPECT_EQ(set(setDouble, session, "Mod1", "DMM.Range", 1.0).code, 0);
    EXPECT_EQ(execute(session, "Mod1", "DMM.Defaults", 0.0).code, 0);
    EXPECT_EQ(get(getDouble, session, "Mod1", "DMM.Range"), 10.0);
}

TEST_F(CommandTest, ACommandThatTakesTimeActsAtItsEnd) {
    EXPECT_EQ(execute(session, "Mod1", "DMM.SelfTest", 10.0).code, 0);
    EXPECT_EQ(getText(session, "Mod1", "Dev.Comment"), std::string("self test passed"));
}

TEST_F(CommandTest, ACommandThatTakesTooLongEndsAtItsTimeout) {
    const Outcome outcome = execute(session, "Mod1", "DMM.SelfTest", 0.0);
    EXPECT_EQ(outcome.code, -250976);
    EXPECT_EQ(outcome.text, detailsOf("commandTimedOut", usage("CommandName", "\"DMM.SelfTest\"") +
                                                             "," + usage("Timeout", "\"0\"")));
    EXPECT_EQ(getText(session, "Mod1", "Dev.Comment"), std::string(""));
    EXPECT_EQ(execute(session, "Mod1", "DMM.Calibrate", 0.01).code, -250976);
    EXPECT_EQ(execute(session, "Mod1", "DMM.Trigger", 0.0).code, 0);
}

TEST_F(CommandTest, AnUnknownCommandIsRefusedWithItsResource) {
    const Outcome outcome = execute(session, "Mod1,Mod2", "DMM.Trigger", 1.0);
    EXPECT_EQ(outcome.code, -250975);
    EXPECT_EQ(outcome.text,
              detailsOf("unknownCommand", usage("CommandName", "\"DMM.Trigger\"") + "," +
                                              usage("ResourceName", "\"Mod2\"")));
    EXPECT_EQ(get(getUInt64, session, "Mod1", "DMM.TriggerCount"), std::uint64_t{0});
}

TEST_F(CommandTest, AMisspeltCommandIsRefusedWithTheNearestName) {
    EXPECT_EQ(execute(session, "Mod1", "dmm.triger", 1.0).text,
              detailsOf("unknownCommand", usage("CommandName", "\"dmm.triger\"") + "," +
                                              usage("ResourceName", "\"Mod1\"") + "," +
                                              usage("NearestName", "\"DMM.Trigger\"")));
}

TEST_F(CommandTest, ACommandNeedsAResourceAndATime) {
    EXPECT_EQ(execute(session, "", "DMM.Trigger", 1.0).code, -250959);
    EXPECT_EQ(execute(session, "Mod1", "DMM.Trigger", -1.0).code, -250962);
    EXPECT_EQ(execute(session, "Mod1", nullptr, 1.0).code, -250954);
}

TEST_F(CommandTest, ACommandNeedsWriteAccessToTheDevice) {
    Session other;
    EXPECT_EQ(execute(other, "Mod1", "DMM.Trigger", 1.0).code, -250811);
    session.reserve("Mod1", 1);
    EXPECT_EQ(execute(session, "Mod1", "DMM.Trigger", 1.0).code, -250972);
}

TEST_F(CommandTest, AnOpenCommandHasItsAttributes) {
    Status status;
    nQITRMCAPI100_Command handle = 0;
    nQITRMCAPI100_openGenericCommand(session, "Mod1", "DMM.Trigger", &handle, &status);
    char* text = nullptr;
    nQITRMCAPI100_getCommandPropertyString(handle, "Cmd.Descr", &text, &status);
    EXPECT_STREQ(text, "Takes a sample.");
    nQITRMCAPI100_freeString(text);
    nQITRMCAPI100_getCommandPropertyString(handle, "Cmd.Doc", &text, &status);
    EXPECT_STREQ(text, "");
    nQITRMCAPI100_freeString(text);
    EXPECT_EQ(status.code, 0) << status.text();
    Status unknown;
    nQITRMCAPI100_getCommandPropertyString(handle, "Cmd.Colour", &text, &unknown);
    EXPECT_EQ(unknown.code, -250974);
    EXPECT_EQ(text, nullptr);
    nQITRMCAPI100_closeCommand(handle, &status);
    EXPECT_EQ(status.code, 0);
    nQITRMCAPI100_closeCommand(handle, &status);
    EXPECT_EQ(status.code, -250973);
}

TEST_F(CommandTest, AnUnknownCommandIsNotOpened) {
    Status status;
    nQITRMCAPI100_Command handle = 5;
    nQITRMCAPI100_openGenericCommand(session, "Mod2", "DMM.Trigger", &handle, &status);
    EXPECT_EQ(status.code, -250975);
    EXPECT_EQ(handle, 0u);
}

TEST_F(CommandTest, ClosingTheSessionClosesItsCommands) {
    Session other;
    Status status;
    nQITRMCAPI100_Command handle = 0;
    nQITRMCAPI100_openGenericCommand(other, "Mod1", "DMM.Trigger", &handle, &status);
    other.close();
    nQITRMCAPI100_closeCommand(handle, &status);
    EXPECT_EQ(status.code, -250973);
}

}  // namespace
