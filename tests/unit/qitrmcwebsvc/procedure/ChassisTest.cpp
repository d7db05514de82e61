#include "support/ProcedureFixture.h"

namespace {

const std::string noSingleDevice =
    failure(-32602, "kUsageTypeDetails", "You must specify none or only one device.");

// Bench is a chassis with Mod2 in slot 4 and Mod1 in slot 1.
class ChassisTest : public ProcedureFixture {
  protected:
    void SetUp() override {
        ProcedureFixture::SetUp();
        giveDataType(3);
        give("getGenericPropertyInt32(7, \"Bench\", \"Dev.ProductCategory\")", std::int64_t{1});
        give("getGenericPropertyInt32(7, \"Mod3\", \"Dev.ProductCategory\")", std::int64_t{2});
        give("getGenericPropertyStringArray(7, \"Bench\", \"Dev.Modules\")", Texts{"Mod2", "Mod1"});
        give("getGenericPropertyUInt32(7, \"Mod2\", \"Dev.SlotNum\")", std::uint64_t{4});
        give("getGenericPropertyUInt32(7, \"Mod1\", \"Dev.SlotNum\")", std::uint64_t{1});
        openSession();
    }

    // Makes Bench, or other devices, the session's default.
    void openSessionOn(const Texts& devices) {
        openSession(R"("devices":"Bench")");
        give("getSessionPropertyStringArray(7, \"Session.DefaultDevices\")", devices);
        give("getGenericPropertyStringArray(7, \"Bench\", \"Dev.Modules\")", Texts{"Mod2", "Mod1"});
    }

    // The calls that read one property, not defined by the driver, of one device.
    static Calls reading(const std::string& device, const std::string& property,
                         const Calls& read) {
        Calls calls = {"getSystemPropertyStringArray(7, \"Sys.SessionProperties\")",
                       "freeStringArray(4)",
                       "getSystemPropertyStringArray(7, \"Sys.SystemProperties\")",
                       "freeStringArray(5)",
                       "getSystemPropertyStringArray(7, \"Sys.DeviceProperties\")",
                       "freeStringArray(3)",
                       "openGenericProperty(7, \"" + device + "\", \"" + property + "\")",
                       "getPropertyPropertyInt32(22, \"Prop.DataType\")"};
        calls.insert(calls.end(), read.begin(), read.end());
        calls.push_back("closeProperty(22)");
        return calls;
    }

    static Calls readingCategory(const std::string& device) {
        return reading(device, "Dev.ProductCategory",
                       {"getGenericPropertyInt32(7, \"" + device + "\", \"Dev.ProductCategory\")"});
    }
    static Calls readingModules(const std::string& chassis) {
        return reading(chassis, "Dev.Modules",
                       {"getGenericPropertyStringArray(7, \"" + chassis + "\", \"Dev.Modules\")",
                        "freeStringArray(2)"});
    }
    static Calls readingSlot(const std::string& module) {
        return reading(module, "Dev.SlotNum",
                       {"getGenericPropertyUInt32(7, \"" + module + "\", \"Dev.SlotNum\")"});
    }
    static Calls joined(const std::vector<Calls>& parts) {
        Calls all;
        for (const Calls& part : parts) {
            all.insert(all.end(), part.begin(), part.end());
        }
        return all;
    }

    // The renames among the calls.
    Calls renames() {
        Calls found;
        for (const std::string& call : driver.takeCalls()) {
            if (call.rfind("renameDevice", 0) == 0) {
                found.push_back(call);
            }
        }
        return found;
    }

    const Calls checkingName = {readDevices, "freeStringArray(4)"};
};

// ---- Module in a slot ---------------------------------------------------------------------------

TEST_F(ChassisTest, FindsTheModuleInASlot) {
    EXPECT_EQ(ask("getModuleName", R"("device":"Bench","slot_number":1)"),
              R"({"module":"Mod1","present":true})");
    EXPECT_EQ(driver.takeCalls(),
              joined({checkingName, readingCategory("Bench"), readingModules("Bench"), checkingName,
                      readingSlot("Mod2"), checkingName, readingSlot("Mod1")}));
}

TEST_F(ChassisTest, StopsAtTheFirstModuleInTheSlot) {
    give("getGenericPropertyUInt32(7, \"Mod1\", \"Dev.SlotNum\")", std::uint64_t{4});
    EXPECT_EQ(ask("getModuleName", R"("device":"Bench","slot_number":4)"),
              R"({"module":"Mod2","present":true})");
    EXPECT_EQ(driver.takeCalls(),
              joined({checkingName, readingCategory("Bench"), readingModules("Bench"), checkingName,
                      readingSlot("Mod2")}));
}

TEST_F(ChassisTest, AnEmptySlotIsNotAnError) {
    EXPECT_EQ(ask("getModuleName", R"("device":"Bench","slot_number":4294967295)"),
              R"({"present":false})");
}

TEST_F(ChassisTest, AChassisWithoutModulesHasEmptySlots) {
    give("getGenericPropertyStringArray(7, \"Bench\", \"Dev.Modules\")", Texts{});
    EXPECT_EQ(ask("getModuleName", R"("device":"Bench","slot_number":1)"), R"({"present":false})");
}

TEST_F(ChassisTest, TheSessionsOwnDeviceIsTheDefault) {
    openSessionOn({"Bench"});
    EXPECT_EQ(ask("getModuleName", R"("slot_number":4)"), R"({"module":"Mod2","present":true})");
}

TEST_F(ChassisTest, AModuleWhoseSlotCannotBeReadFailsTheSearch) {
    fail("getGenericPropertyUInt32(7, \"Mod2\", \"Dev.SlotNum\")", -250999);
    EXPECT_EQ(ask("getModuleName", R"("device":"Bench","slot_number":1)"), "-250999");
    EXPECT_EQ(driver.calls().back(), "closeProperty(22)");
}

TEST_F(ChassisTest, AModuleUnknownToTheDriverFailsTheSearch) {
    give("getGenericPropertyStringArray(7, \"Bench\", \"Dev.Modules\")", Texts{"Ghost"});
    EXPECT_EQ(ask("getModuleName", R"("device":"Bench","slot_number":1)"),
              failure(-250828, "kUsageTypeRequestedValue", "Ghost"));
}

TEST_F(ChassisTest, SlotsAreCountedFromOne) {
    EXPECT_EQ(
        ask("getModuleName", R"("device":"Bench","slot_number":0)"),
        R"(-32602 [{"type":"usage","usage":"kUsageTypeParameter","value":"#/params/slot_number",)"
        R"("value_type":"string"},{"type":"usage","usage":"kUsageTypeDetails",)"
        R"("value":"The number must be greater than or equal to 1","value_type":"string"}])");
}

// ---- Rules of all three methods
// ------------------------------------------------------------------

struct Question {
    const char* method;
    const char* before;  // members of params around the chassis's name
    const char* after;
};

void PrintTo(const Question& question, std::ostream* out) {
    *out << question.method;
}

class OfOneChassisTest : public ChassisTest, public testing::WithParamInterface<Question> {
  protected:
    std::string askAbout(const std::string& device) {
        return ask(GetParam().method, GetParam().before + device + GetParam().after);
    }
};

TEST_P(OfOneChassisTest, ADeviceOfAnotherCategoryIsRefusedWithoutDetails) {
    EXPECT_EQ(askAbout("Mod3"), "-250812");
    EXPECT_EQ(driver.takeCalls(), joined({checkingName, readingCategory("Mod3")}));
}

TEST_P(OfOneChassisTest, ATextOfTwoDevicesIsRefused) {
    EXPECT_EQ(askAbout("Bench,Mod1"), noSingleDevice);
    EXPECT_EQ(driver.takeCalls(), checkingName);
}

TEST_P(OfOneChassisTest, AnUnknownDeviceIsRefused) {
    EXPECT_EQ(askAbout("Mod9"), failure(-250828, "kUsageTypeRequestedValue", "Mod9"));
}

TEST_P(OfOneChassisTest, ACategoryThatCannotBeReadIsTheFailure) {
    fail("getGenericPropertyInt32(7, \"Bench\", \"Dev.ProductCategory\")", -250999,
         R"({"from":"driver"})");
    EXPECT_EQ(askAbout("Bench"), "-250999");
    EXPECT_EQ(statusText, R"({"from":"driver"})");
}

INSTANTIATE_TEST_SUITE_P(
    Methods, OfOneChassisTest,
    testing::Values(Question{"getModuleName", R"("slot_number":1,"device":")", "\""},
                    Question{"renameChassisAndAllConnectedModules", R"("old_chassis_name":")",
                             R"(","new_chassis_name":"B")"},
                    Question{"GetChassisIpOrHostname", R"("device":")", "\""}),
    [](const auto& question) { return std::string(question.param.method); });

TEST_F(ChassisTest, ASessionWithoutADefaultDeviceMustNameOne) {
    EXPECT_EQ(ask("getModuleName", R"("slot_number":1)"), noSingleDevice);
    EXPECT_EQ(ask("GetChassisIpOrHostname"), noSingleDevice);
    openSession(R"("physical_channels":"Mod1/ch0")");
    EXPECT_EQ(ask("getModuleName", R"("slot_number":1)"), noSingleDevice);
    EXPECT_EQ(driver.takeCalls(), Calls{});
}

// ---- Renaming -----------------------------------------------------------------------------------

const std::string benchToB = R"("old_chassis_name":"Bench","new_chassis_name":"B")";

TEST_F(ChassisTest, RenamesEachModuleBeforeTheNextIsReadAndTheChassisLast) {
    EXPECT_EQ(ask("renameChassisAndAllConnectedModules", benchToB),
              R"({"new_module_names":["B-Mod4","B-Mod1"],"new_chassis_name":"B"})");
    EXPECT_EQ(driver.takeCalls(),
              joined({checkingName, readingCategory("Bench"), readingModules("Bench"), checkingName,
                      readingSlot("Mod2"), Calls{"renameDevice(7, \"Mod2\", \"B-Mod4\")"},
                      checkingName, readingSlot("Mod1"),
                      Calls{"renameDevice(7, \"Mod1\", \"B-Mod1\")",
                            "renameDevice(7, \"Bench\", \"B\")"}}));
}

TEST_F(ChassisTest, RenamesAChassisWithoutModules) {
    give("getGenericPropertyStringArray(7, \"Bench\", \"Dev.Modules\")", Texts{});
    EXPECT_EQ(ask("renameChassisAndAllConnectedModules", benchToB),
              R"({"new_module_names":[],"new_chassis_name":"B"})");
    EXPECT_EQ(renames(), Calls{"renameDevice(7, \"Bench\", \"B\")"});
}

TEST_F(ChassisTest, WritesTheWholeSlotNumberWithoutLeadingZeros) {
    give("getGenericPropertyStringArray(7, \"Bench\", \"Dev.Modules\")", Texts{"Mod1"});
    give("getGenericPropertyUInt32(7, \"Mod1\", \"Dev.SlotNum\")", std::uint64_t{4294967295});
    EXPECT_EQ(ask("renameChassisAndAllConnectedModules", benchToB),
              R"({"new_module_names":["B-Mod4294967295"],"new_chassis_name":"B"})");
}

TEST_F(ChassisTest, AFailedModuleStopsTheRenamingThere) {
    fail("renameDevice(7, \"Mod1\", \"B-Mod1\")", -250999, R"({"from":"driver"})");
    EXPECT_EQ(ask("renameChassisAndAllConnectedModules", benchToB), "-250999");
    EXPECT_EQ(statusText, R"({"from":"driver"})");
    EXPECT_EQ(renames(), (Calls{"renameDevice(7, \"Mod2\", \"B-Mod4\")",
                                "renameDevice(7, \"Mod1\", \"B-Mod1\")"}));
}

TEST_F(ChassisTest, AFailedChassisLeavesTheModulesRenamed) {
    fail("renameDevice(7, \"Bench\", \"B\")", -250999);
    EXPECT_EQ(ask("renameChassisAndAllConnectedModules", benchToB), "-250999");
    EXPECT_EQ(renames().size(), 3u);
}

TEST_F(ChassisTest, AModuleWhoseSlotCannotBeReadIsNotRenamedNorAreThoseAfterIt) {
    fail("getGenericPropertyUInt32(7, \"Mod2\", \"Dev.SlotNum\")", -250999);
    EXPECT_EQ(ask("renameChassisAndAllConnectedModules", benchToB), "-250999");
    EXPECT_EQ(renames(), Calls{});
}

TEST_F(ChassisTest, ANewNameEndsAtItsFirstNul) {
    EXPECT_EQ(ask("renameChassisAndAllConnectedModules",
                  R"("old_chassis_name":"Bench","new_chassis_name":"B\u0000x")"),
              R"({"new_module_names":["B-Mod4","B-Mod1"],"new_chassis_name":"B"})");
}

// ---- Network identity ---------------------------------------------------------------------------

TEST_F(ChassisTest, ReturnsTheAddressAndThenTheHostname) {
    give("getDevicePropertyString(7, \"Bench\", \"Dev.TCPIP.EthernetIP\")",
         std::string("192.0.2.7"));
    give("getDevicePropertyString(7, \"Bench\", \"Dev.TCPIP.Hostname\")", std::string("bench"));
    EXPECT_EQ(ask("GetChassisIpOrHostname", R"("device":"Bench")"),
              R"({"chassis_ip":"192.0.2.7","chassis_hostname":"bench"})");
    EXPECT_EQ(driver.takeCalls(),
              joined({checkingName, readingCategory("Bench"),
                      Calls{"getDevicePropertyString(7, \"Bench\", \"Dev.TCPIP.EthernetIP\")",
                            "freeString()",
                            "getDevicePropertyString(7, \"Bench\", \"Dev.TCPIP.Hostname\")",
                            "freeString()"}}));
}

TEST_F(ChassisTest, TheDefaultDeviceIsPassedToTheDriverAsNull) {
    openSessionOn({"Bench"});
    give("getDevicePropertyString(7, null, \"Dev.TCPIP.EthernetIP\")", std::string("192.0.2.7"));
    give("getDevicePropertyString(7, null, \"Dev.TCPIP.Hostname\")", std::string("bench"));
    EXPECT_EQ(ask("GetChassisIpOrHostname"),
              R"({"chassis_ip":"192.0.2.7","chassis_hostname":"bench"})");
}

TEST_F(ChassisTest, TheDeviceIsPassedToTheDriverAsTheClientWroteIt) {
    give("getGenericPropertyInt32(7, \"bench\", \"Dev.ProductCategory\")", std::int64_t{1});
    EXPECT_EQ(ask("GetChassisIpOrHostname", R"("device":"bench")"),
              R"({"chassis_ip":"","chassis_hostname":""})");
    EXPECT_EQ(driver.calls()[driver.calls().size() - 2],
              "getDevicePropertyString(7, \"bench\", \"Dev.TCPIP.Hostname\")");
}

// Where the driver takes a list of names, leading zeros of the number in a path name are removed.
class ChassisWithAPathTest : public ChassisTest {
  protected:
    void SetUp() override {
        ChassisTest::SetUp();
        give("getSystemPropertyStringArray(7, \"Sys.Devices\")", Texts{"Rack/Bench3"});
        give("getGenericPropertyInt32(7, \"Rack/Bench3\", \"Dev.ProductCategory\")",
             std::int64_t{1});
    }
};

TEST_F(ChassisWithAPathTest, TheDeviceIsPassedToTheDriverWithItsLeadingZeros) {
    give("getDevicePropertyString(7, \"Rack/Bench03\", \"Dev.TCPIP.EthernetIP\")",
         std::string("192.0.2.7"));
    give("getDevicePropertyString(7, \"Rack/Bench03\", \"Dev.TCPIP.Hostname\")",
         std::string("bench"));
    EXPECT_EQ(ask("GetChassisIpOrHostname", R"("device":"Rack/Bench03")"),
              R"({"chassis_ip":"192.0.2.7","chassis_hostname":"bench"})");
}

TEST_F(ChassisWithAPathTest, TheChassisIsRenamedUnderTheNameThatTheClientWrote) {
    EXPECT_EQ(ask("renameChassisAndAllConnectedModules",
                  R"("old_chassis_name":"Rack/Bench03","new_chassis_name":"B")"),
              R"({"new_module_names":[],"new_chassis_name":"B"})");
    EXPECT_EQ(renames(), Calls{"renameDevice(7, \"Rack/Bench03\", \"B\")"});
}

TEST_F(ChassisTest, AnIdentityThatCannotBeReadIsTheFailure) {
    give("getDevicePropertyString", std::string("x"));
    fail("getDevicePropertyString(7, \"Bench\", \"Dev.TCPIP.Hostname\")", -250999);
    EXPECT_EQ(ask("GetChassisIpOrHostname", R"("device":"Bench")"), "-250999");
}

}  // namespace
