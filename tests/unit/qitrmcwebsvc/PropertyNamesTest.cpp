#include "qitrmcwebsvc/propertyNames.h"

#include "qitrmcsharedcmn/Exceptions.h"
#include "support/ProcedureFixture.h"

using namespace nQITRMCWEBSVC100;

namespace {

using Names = std::set<std::string>;
using PropertyNamesTest = ProcedureFixture;

TEST_F(PropertyNamesTest, AreSortedWithoutTheHiddenOnes) {
    EXPECT_EQ(propertyNames(7, PropertyCategory::System),
              (Names{"Sys.Delay", "Sys.Devices", "Sys.Simulated", "Sys.Ticks"}));
    EXPECT_EQ(propertyNames(7, PropertyCategory::Session),
              (Names{"Session.Name", "Session.ReservedDevices", "Session.Timeout"}));
    EXPECT_EQ(propertyNames(7, PropertyCategory::Device), (Names{"Dev.Name", "Dev.Temperature"}));
    EXPECT_EQ(propertyNames(7, PropertyCategory::PhysChan), (Names{"PhysChan.Range"}));
    EXPECT_EQ(propertyNames(7, PropertyCategory::NvmemArea), (Names{"NVMEM.Size"}));
    EXPECT_EQ(
        driver.calls(),
        (Calls{"getSystemPropertyStringArray(7, \"Sys.SystemProperties\")", "freeStringArray(5)",
               "getSystemPropertyStringArray(7, \"Sys.SessionProperties\")", "freeStringArray(4)",
               "getSystemPropertyStringArray(7, \"Sys.DeviceProperties\")", "freeStringArray(3)",
               "getSystemPropertyStringArray(7, \"Sys.PhysChanProperties\")", "freeStringArray(2)",
               "getSystemPropertyStringArray(7, \"Sys.NVMEMAreaProperties\")",
               "freeStringArray(1)"}));
}

TEST_F(PropertyNamesTest, OmitTwelveNamesFromEveryList) {
    const Texts hidden = {"Dev.AddedToLocalConfig",
                          "Dev.Events",
                          "Dev.TCPIP.LastConnectedEthernetIP",
                          "PhysChan.Events",
                          "Session.Language",
                          "Session.TCPIP.ConnectTimeout",
                          "Session.TCPIP.ConnectTimeoutPerIP",
                          "Session.TCPIP.KeepAliveInterval",
                          "Session.TCPIP.KeepAliveTimeout",
                          "Session.TCPIP.MDNSBrowseTimeout",
                          "Session.TCPIP.SendRecvTimeout",
                          "Sys.ConfigChangeCount"};
    Texts listed = hidden;
    listed.push_back("Dev.TCPIP.EthernetIP");
    give("getSystemPropertyStringArray", listed);
    give("getSystemPropertyStringArray(7, \"Sys.NVMEMAreaProperties\")", listed);
    EXPECT_EQ(propertyNames(7, PropertyCategory::NvmemArea), (Names{"Dev.TCPIP.EthernetIP"}));
    for (const std::string& name : hidden) {
        EXPECT_FALSE(isPropertyName(7, PropertyCategory::NvmemArea, name)) << name;
    }
    EXPECT_TRUE(isPropertyName(7, PropertyCategory::NvmemArea, "Dev.TCPIP.EthernetIP"));
    EXPECT_FALSE(isPropertyName(7, PropertyCategory::NvmemArea, "Dev.TCPIP.Hostname"));
}

TEST_F(PropertyNamesTest, DoNotEqualANameThatGoesOnBehindANul) {
    give("getSystemPropertyStringArray(7, \"Sys.DeviceProperties\")", Texts{"Dev.Type", ""});
    EXPECT_TRUE(isPropertyName(7, PropertyCategory::Device, "Dev.Type"));
    EXPECT_FALSE(isPropertyName(7, PropertyCategory::Device, std::string("Dev.Type\0", 9)));
    EXPECT_FALSE(isPropertyName(7, PropertyCategory::Device, std::string("\0Dev.Type", 9)));
}

TEST_F(PropertyNamesTest, AreReadAgainEachTime) {
    EXPECT_FALSE(isPropertyName(7, PropertyCategory::PhysChan, "PhysChan.New"));
    give("getSystemPropertyStringArray(7, \"Sys.PhysChanProperties\")", Texts{"PhysChan.New"});
    EXPECT_TRUE(isPropertyName(7, PropertyCategory::PhysChan, "PhysChan.New"));
}

TEST_F(PropertyNamesTest, FailWithTheDriversErrorAndFreeTheList) {
    RecordingDriver::Reply refusal;
    refusal.value = Texts{"Sys.Delay"};
    refusal.code = -250844;
    driver.reply("getSystemPropertyStringArray(7, \"Sys.SystemProperties\")", refusal);
    EXPECT_THROW(propertyNames(7, PropertyCategory::System), qierr::Exception);
    EXPECT_EQ(driver.calls().back(), "freeStringArray(1)");
}

TEST_F(PropertyNamesTest, OfAnUnknownCategoryAreAnInternalError) {
    for (const std::int32_t number : {0, 6, -1}) {
        try {
            propertyNames(7, static_cast<PropertyCategory>(number));
            ADD_FAILURE() << number;
        } catch (const nQITRMCSHAREDCMN100::InternalError& error) {
            EXPECT_EQ(error.status()->code, -250800);
            EXPECT_NE(
                std::string(error.what()).find(R"("comment":"Unsupported property category")"),
                std::string::npos)
                << error.what();
        }
    }
    EXPECT_EQ(driver.calls(), Calls{});
}

}  // namespace
