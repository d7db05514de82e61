#include <algorithm>

#include "Driver.h"

using namespace drivertest;

namespace {

std::int32_t codeOfOpening(const char* channels, std::string* text = nullptr) {
    Status status;
    Handle handle = 0;
    nQITRMCAPI100_initializeSessionWithPhysChans(&handle, channels, 60.0, 1, "", 0.0, &status);
    if (text != nullptr) {
        *text = status.text();
    }
    Status closing;
    nQITRMCAPI100_closeSession(handle, &closing);
    return status.code;
}

Names openedChannels(const char* channels) {
    Status status;
    Session session;
    session.close();
    nQITRMCAPI100_initializeSessionWithPhysChans(&session.handle, channels, 60.0, 1, "", 0.0,
                                                 &status);
    EXPECT_EQ(status.code, 0) << status.text();
    return session.list("Session.DefaultPhysChans");
}

TEST(NameListTest, TheSystemListsItsDevicesInOrder) {
    Session session;
    EXPECT_EQ(session.systemList("Sys.Devices"), (Names{"Bench", "Mod1", "Mod2", "Mod4", "Mod5"}));
}

TEST(NameListTest, ADeviceListsItsChannels) {
    Session session;
    EXPECT_EQ(session.deviceList("Mod1", "Dev.PhysChans"),
              (Names{"Mod1/ch0", "Mod1/ch1", "Mod1/ch2", "Mod1/ch3"}));
    EXPECT_EQ(session.deviceList("Mod2", "Dev.PhysChans"), (Names{"Mod2/ch0", "Mod2/ch1"}));
    EXPECT_EQ(session.deviceList("Mod4", "Dev.PhysChans").size(), 8u);
    EXPECT_EQ(session.deviceList("Mod5", "Dev.PhysChans"), Names());
    EXPECT_EQ(session.deviceList("Bench", "Dev.PhysChans"), Names());
}

TEST(NameListTest, ADeviceListsItsAreas) {
    Session session;
    for (const std::string module : {"Mod1", "Mod2", "Mod4", "Mod5"}) {
        EXPECT_EQ(session.deviceList(module.c_str(), "Dev.NVMEM.Areas"),
                  (Names{module + "/user", module + "/calibration"}));
    }
    EXPECT_EQ(session.deviceList("Bench", "Dev.NVMEM.Areas"), Names());
}

TEST(NameListTest, TheListsOfAnUnknownDeviceAreRefused) {
    Session session;
    Status status;
    char** array = reinterpret_cast<char**>(&status);
    std::uint32_t count = 9;
    nQITRMCAPI100_getGenericPropertyStringArray(session, "Mod3", "Dev.PhysChans", &array, &count,
                                                &status);
    EXPECT_EQ(status.code, -250956);
    EXPECT_EQ(status.text(), detailsOf("unknownDevice", usage("RequestedValue", "\"Mod3\"")));
    EXPECT_EQ(array, nullptr);
    EXPECT_EQ(count, 0u);
}

TEST(NameListTest, TheFivePropertyListsNameTheirCategories) {
    Session session;
    const auto holds = [&](const char* list, const char* name) {
        const Names names = session.systemList(list);
        return std::count(names.begin(), names.end(), name) == 1;
    };
    EXPECT_TRUE(holds("Sys.SystemProperties", "Sys.Devices"));
    EXPECT_TRUE(holds("Sys.SystemProperties", "Sys.SystemProperties"));
    EXPECT_TRUE(holds("Sys.SessionProperties", "Session.ReservedDevices"));
    EXPECT_TRUE(holds("Sys.DeviceProperties", "Dev.PhysChans"));
    EXPECT_TRUE(holds("Sys.DeviceProperties", "Dev.ProductCategory"));
    EXPECT_TRUE(holds("Sys.PhysChanProperties", "PhysChan.Commands"));
    EXPECT_FALSE(session.systemList("Sys.NVMEMAreaProperties").empty());
}

TEST(NameListTest, ThePropertyListsContainTheInternalNamesToo) {
    Session session;
    Names all;
    for (const char* list : {"Sys.SystemProperties", "Sys.SessionProperties",
                             "Sys.DeviceProperties", "Sys.PhysChanProperties"}) {
        const Names names = session.systemList(list);
        all.insert(all.end(), names.begin(), names.end());
    }
    for (const char* internal :
         {"Dev.AddedToLocalConfig", "Dev.Events", "Dev.TCPIP.LastConnectedEthernetIP",
          "PhysChan.Events", "Session.Language", "Session.TCPIP.ConnectTimeout",
          "Session.TCPIP.ConnectTimeoutPerIP", "Session.TCPIP.KeepAliveInterval",
          "Session.TCPIP.KeepAliveTimeout", "Session.TCPIP.MDNSBrowseTimeout",
          "Session.TCPIP.SendRecvTimeout", "Sys.ConfigChangeCount"}) {
        EXPECT_EQ(std::count(all.begin(), all.end(), internal), 1) << internal;
    }
}

TEST(NameListTest, NamesAreFoundInAnyLetterCaseAndKeptAsTheChassisSpellsThem) {
    Session session("mOD1,MOD2");
    EXPECT_EQ(session.list("Session.DefaultDevices"), (Names{"Mod1", "Mod2"}));
    EXPECT_EQ(openedChannels("MOD4/CH3"), Names{"Mod4/ch3"});
}

TEST(NameListTest, ADefaultThatIsNamedTwiceIsListedOnce) {
    EXPECT_EQ(openedChannels("Mod1/ch1,Mod1/ch0:1"), (Names{"Mod1/ch1", "Mod1/ch0"}));
}

TEST(NameListTest, AnEmptyNameInAListIsRefused) {
    Session session;
    for (const char* list : {"Mod1,", ",Mod1", ","}) {
        EXPECT_EQ(session.reserve(list), -250956) << list;
    }
}

TEST(NameListTest, RangesNameChannelsInOrder) {
    EXPECT_EQ(openedChannels("Mod1/ch2:3,Mod2/ch0,Mod1/ch0:0"),
              (Names{"Mod1/ch2", "Mod1/ch3", "Mod2/ch0", "Mod1/ch0"}));
}

TEST(NameListTest, ARangeBeyondTheChannelsNamesTheFirstUnknownOne) {
    std::string text;
    EXPECT_EQ(codeOfOpening("Mod1/ch2:5", &text), -250957);
    EXPECT_EQ(text, detailsOf("unknownPhysChan", usage("RequestedValue", "\"Mod1/ch4\"")));
}

TEST(NameListTest, MalformedRangesAreRefused) {
    for (const char* range :
         {"Mod1/ch3:1", "Mod1/ch1:", "Mod1/ch:1", "Mod1/:", "Mod1/ch0:x", "Mod1/ch0:1:2",
          "Mod1/ch0:4294967296", "Mod1/ch4294967296:4294967297", "Mod1/ch1:1025"}) {
        EXPECT_EQ(codeOfOpening(range), -250960) << range;
    }
    EXPECT_EQ(codeOfOpening("Mod1/ch0:1023"), -250957);
}

TEST(NameListTest, AColonWithoutASlashIsNotARange) {
    Session session;
    EXPECT_EQ(session.reserve("Mod1:2"), -250956);
}

TEST(NameListTest, UnknownNamesAreRefusedByTheirKind) {
    EXPECT_EQ(codeOfOpening("Mod1"), -250957);
    EXPECT_EQ(codeOfOpening("Mod1/user"), -250957);
    EXPECT_EQ(codeOfOpening("Mod1/ch4"), -250957);
    EXPECT_EQ(codeOfOpening("Mod3/ch0"), -250957);
    EXPECT_EQ(codeOfOpening("Mod1/ch0/x"), -250957);
    Status area;
    Handle handle = 0;
    nQITRMCAPI100_initializeSessionWithNvmemAreas(&handle, "Mod1/ch0", 60.0, 1, "", 0.0, &area);
    EXPECT_EQ(area.code, -250958);
    Session session;
    EXPECT_EQ(session.reserve("Mod1/ch0"), -250956);
    EXPECT_EQ(session.reserve("Mod1,,Mod2"), -250956);
    EXPECT_EQ(session.reserve("$Mod1"), -250956);
}

TEST(NameListTest, ATextThatIsNotUtf8IsRepairedInTheDetails) {
    Session session;
    Status status;
    nQITRMCAPI100_reserveDevices(session, "M\xC3\"\x01\xFF", 3, "", 0.0, &status);
    EXPECT_EQ(status.code, -250956);
    EXPECT_EQ(status.text(),
              detailsOf("unknownDevice",
                        usage("RequestedValue", "\"M\xEF\xBF\xBD\\\"\\u0001\xEF\xBF\xBD\"")));
}

}  // namespace
