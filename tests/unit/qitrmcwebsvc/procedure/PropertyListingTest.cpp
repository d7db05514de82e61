#include "support/ProcedureFixture.h"

namespace {

const std::string readNames = "getSystemPropertyStringArray(7, \"Sys.";
const std::string needsResource =
    failure(-32602, "kUsageTypeDetails",
            "You must specify at least one of the following parameters: device, physical_channel, "
            "nvmem_area.");

class PropertyListingTest : public ProcedureFixture {
  protected:
    void SetUp() override {
        ProcedureFixture::SetUp();
        openSession();
    }
};

TEST_F(PropertyListingTest, SessionPropertiesComeBeforeSystemProperties) {
    EXPECT_EQ(ask("getSessionPropertyList"),
              R"({"properties":["Session.Name","Session.ReservedDevices","Session.Timeout",)"
              R"("Sys.Delay","Sys.Devices","Sys.Simulated","Sys.Ticks"]})");
    EXPECT_EQ(driver.takeCalls(), (Calls{readNames + "SessionProperties\")", "freeStringArray(4)",
                                         readNames + "SystemProperties\")", "freeStringArray(5)"}));
}

TEST_F(PropertyListingTest, EachPartIsSortedSeparatelyAndANameInBothAppearsTwice) {
    give(readNames + "SessionProperties\")", Texts{"z", "b"});
    give(readNames + "SystemProperties\")", Texts{"b", "a", "a"});
    EXPECT_EQ(ask("getSessionPropertyList"), R"({"properties":["b","z","a","b"]})");
}

TEST_F(PropertyListingTest, EmptyListsResultInAnEmptyArray) {
    give(readNames + "SessionProperties\")", Texts{});
    give(readNames + "SystemProperties\")", Texts{});
    EXPECT_EQ(ask("getSessionPropertyList"), R"({"properties":[]})");
}

TEST_F(PropertyListingTest, ADeviceHasStaticAndDynamicProperties) {
    give("getGenericPropertyStringArray(7, \"Mod1\", \"Dev.Properties\")",
         Texts{"Dev.Zeta", "Dev.Alpha"});
    EXPECT_EQ(ask("getDevicePropertyList", R"("device":"Mod1")"),
              R"({"static_properties":["Dev.Name","Dev.Temperature"],)"
              R"("dynamic_properties":["Dev.Zeta","Dev.Alpha"]})");
    EXPECT_EQ(driver.takeCalls(),
              (Calls{readNames + "Devices\")", "freeStringArray(4)",
                     readNames + "DeviceProperties\")", "freeStringArray(3)",
                     "getGenericPropertyStringArray(7, \"Mod1\", \"Dev.Properties\")",
                     "freeStringArray(2)"}));
}

TEST_F(PropertyListingTest, APhysicalChannelHasItsOwnLists) {
    give("getGenericPropertyStringArray(7, \"Mod1/ch0\", \"PhysChan.Properties\")",
         Texts{"PhysChan.Extra"});
    EXPECT_EQ(ask("getDevicePropertyList", R"("physical_channel":"Mod1/ch0")"),
              R"({"static_properties":["PhysChan.Range"],)"
              R"("dynamic_properties":["PhysChan.Extra"]})");
}

TEST_F(PropertyListingTest, AnNvmemAreaHasNoDynamicPropertiesAndTheDriverIsNotCalled) {
    EXPECT_EQ(ask("getDevicePropertyList", R"("nvmem_area":"Mod1/user")"),
              R"({"static_properties":["NVMEM.Size"]})");
    EXPECT_EQ(
        driver.takeCalls(),
        (Calls{"getGenericPropertyStringArray(7, \"Mod1\", \"Dev.NVMEM.Areas\")",
               "freeStringArray(1)", readNames + "NVMEMAreaProperties\")", "freeStringArray(1)"}));
}

TEST_F(PropertyListingTest, AnEmptyDynamicListIsAnEmptyArray) {
    give("getGenericPropertyStringArray(7, \"Mod1\", \"Dev.Properties\")", Texts{});
    EXPECT_EQ(ask("getDevicePropertyList", R"("device":"Mod1")"),
              R"({"static_properties":["Dev.Name","Dev.Temperature"],"dynamic_properties":[]})");
}

TEST_F(PropertyListingTest, AFailedDynamicListDoesNotAffectTheStaticList) {
    RecordingDriver::Reply refusal;
    refusal.value = Texts{"Dev.Zeta"};
    refusal.code = -250999;
    driver.reply("getGenericPropertyStringArray(7, \"Mod1\", \"Dev.Properties\")", refusal);
    EXPECT_EQ(ask("getDevicePropertyList", R"("device":"Mod1")"),
              R"({"static_properties":["Dev.Name","Dev.Temperature"]})");
    EXPECT_EQ(driver.calls().back(), "freeStringArray(1)");
}

TEST_F(PropertyListingTest, AFailedStaticListFailsTheMethod) {
    fail(readNames + "DeviceProperties\")", -250999);
    EXPECT_EQ(ask("getDevicePropertyList", R"("device":"Mod1")"), "-250999");
}

TEST_F(PropertyListingTest, AnUnknownDeviceFailsBeforeAnyListIsRead) {
    EXPECT_EQ(ask("getDevicePropertyList", R"("device":"Mod9")"),
              failure(-250828, "kUsageTypeRequestedValue", "Mod9"));
    EXPECT_EQ(driver.takeCalls(), (Calls{readNames + "Devices\")", "freeStringArray(4)"}));
}

TEST_F(PropertyListingTest, ASessionWithoutResourcesMustNameOne) {
    EXPECT_EQ(ask("getDevicePropertyList"), needsResource);
    EXPECT_EQ(driver.takeCalls(), Calls{});
}

TEST_F(PropertyListingTest, ASessionsOwnResourcesAreTheDefault) {
    openSession(R"("physical_channels":"Mod1/ch0")");
    give("getGenericPropertyStringArray(7, \"$DefaultPhysChans\", \"PhysChan.Properties\")",
         Texts{"PhysChan.Extra"});
    EXPECT_EQ(ask("getDevicePropertyList"), R"({"static_properties":["PhysChan.Range"],)"
                                            R"("dynamic_properties":["PhysChan.Extra"]})");
}

TEST_F(PropertyListingTest, TwoResourcesAreRefusedByTheSchema) {
    EXPECT_EQ(ask("getDevicePropertyList", R"("device":"Mod1","nvmem_area":"Mod1/user")"),
              R"(-32602 [{"type":"usage","usage":"kUsageTypeParameter","value":"#/params",)"
              R"("value_type":"string"},{"type":"usage","usage":"kUsageTypeDetails",)"
              R"("value":"You must specify none or only one of the following parameters: device, )"
              R"(physical_channel, nvmem_area.","value_type":"string"}])");
}

}  // namespace
