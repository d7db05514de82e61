#include "qitrmcwebsvc/RequestResource.h"

#include <string>

#include "support/DriverTest.h"
#include "support/Failures.h"

using namespace nQITRMCWEBSVC100;

namespace {

class RequestResourceTest : public DriverTest {
  protected:
    void SetUp() override {
        DriverTest::SetUp();
        driver.give("getSystemPropertyStringArray(7, \"Sys.Devices\")", Calls{"Mod1", "Mod2"});
        driver.give("getGenericPropertyStringArray(7, \"Mod1\", \"Dev.PhysChans\")",
                    Calls{"Mod1/ch0", "Mod1/ch1"});
        driver.give("getGenericPropertyStringArray(7, \"Mod1\", \"Dev.NVMEM.Areas\")",
                    Calls{"Mod1/user"});
    }

    static RequestResource read(const std::string& params) {
        JsonDocument document;
        document.Parse(params.c_str());
        return RequestResource(document);
    }

    static RequestResource check(const std::string& params,
                                 ResourceKind defaultKind = ResourceKind::None) {
        JsonDocument document;
        document.Parse(params.c_str());
        return RequestResource(document, 7, defaultKind);
    }

    const std::string unknown = "BasicError: -250828 kUsageTypeRequestedValue=";
};

TEST_F(RequestResourceTest, ReadsEachMemberWithItsKind) {
    const std::pair<const char*, ResourceKind> members[] = {
        {"devices", ResourceKind::Device},
        {"physical_channels", ResourceKind::PhysicalChannel},
        {"nvmem_areas", ResourceKind::NvmemArea},
        {"device", ResourceKind::Device},
        {"physical_channel", ResourceKind::PhysicalChannel},
        {"nvmem_area", ResourceKind::NvmemArea}};
    for (const auto& [member, kind] : members) {
        const RequestResource resource = read(std::string("{\"") + member + "\":\"A\"}");
        EXPECT_EQ(resource.kind(), kind) << member;
        EXPECT_EQ(resource.names(), Calls{"A"}) << member;
    }
    EXPECT_EQ(driver.takeCalls(), Calls{});
}

TEST_F(RequestResourceTest, IsOfNoKindWithoutAMember) {
    EXPECT_EQ(read("{\"property\":\"x\"}").kind(), ResourceKind::None);
    EXPECT_EQ(read("{}").names(), Calls{});
}

TEST_F(RequestResourceTest, ExpandsTextsAndArraysOfTexts) {
    EXPECT_EQ(read("{\"physical_channels\":\"Mod1/ch0:2,Mod2/ch7\"}").names(),
              (Calls{"Mod1/ch0", "Mod1/ch1", "Mod1/ch2", "Mod2/ch7"}));
    EXPECT_EQ(read("{\"physical_channels\":[\"Mod2/ch7\",\"Mod1/ch0:1\"]}").names(),
              (Calls{"Mod2/ch7", "Mod1/ch0", "Mod1/ch1"}));
    EXPECT_EQ(read("{\"devices\":[\"A\",\"B\"]}").joinedNames(), "A,B");
    EXPECT_EQ(read("{\"physical_channels\":[\"Mod1/ch0\",\"Mod1/ch1\"]}").joinedNames(),
              "Mod1/ch0:1");
}

TEST_F(RequestResourceTest, RefusesAMemberThatIsNeitherTextNorArray) {
    EXPECT_EQ(failureOf([] { read("{\"devices\":1}"); }),
              "InternalError: -250800 comment=Invalid data type for the name of resource(s)");
}

TEST_F(RequestResourceTest, RefusesABadRangeWithItsText) {
    EXPECT_EQ(failureOf([] { read("{\"physical_channels\":\"Mod1/ch4:1\"}"); }),
              unknown + "Mod1/ch4:1");
}

TEST_F(RequestResourceTest, KeepsNamesAfterANul) {
    EXPECT_EQ(failureOf([] { read("{\"devices\":\"Mod1\\u0000,Mod2\"}"); }), unknown + "Mod1");
    EXPECT_EQ(failureOf([] { read("{\"devices\":[\"Mod2\",\"\\u0000\",\"Mod1\"]}"); }), unknown);
    EXPECT_EQ(failureOf([] { check("{\"device\":\"Mod1\\u0000\"}"); }), unknown + "Mod1");
}

TEST_F(RequestResourceTest, ReadsTheDeviceListOnceForAllDevices) {
    check("{\"devices\":\"Mod2,Mod1\"}");
    EXPECT_EQ(driver.takeCalls(),
              (Calls{"getSystemPropertyStringArray(7, \"Sys.Devices\")", "freeStringArray(2)"}));
}

TEST_F(RequestResourceTest, ReadsAListForEachChannelAndArea) {
    check("{\"physical_channels\":\"Mod1/ch0:1\"}");
    const std::string channels = "getGenericPropertyStringArray(7, \"Mod1\", \"Dev.PhysChans\")";
    EXPECT_EQ(driver.takeCalls(),
              (Calls{channels, "freeStringArray(2)", channels, "freeStringArray(2)"}));
    check("{\"nvmem_area\":\"Mod1/user\"}");
    EXPECT_EQ(driver.takeCalls(),
              (Calls{"getGenericPropertyStringArray(7, \"Mod1\", \"Dev.NVMEM.Areas\")",
                     "freeStringArray(1)"}));
}

TEST_F(RequestResourceTest, UsesTheTextBeforeTheFirstSlashAsTheDevice) {
    driver.give("getGenericPropertyStringArray(7, \"Mod1\", \"Dev.PhysChans\")",
                Calls{"Mod1/a/b0"});
    EXPECT_EQ(check("{\"physical_channel\":\"Mod1/a/b0\"}").names(), Calls{"Mod1/a/b0"});
}

TEST_F(RequestResourceTest, RefusesANameThatTheDriverDoesNotKnow) {
    EXPECT_EQ(failureOf([] { check("{\"devices\":\"Mod1,Mod3\"}"); }), unknown + "Mod3");
    EXPECT_EQ(failureOf([] { check("{\"device\":\"Mod1:3\"}"); }), unknown + "Mod1:3");
    EXPECT_EQ(failureOf([] { check("{\"device\":\"\"}"); }), unknown);
    EXPECT_EQ(failureOf([] { check("{\"physical_channel\":\"Mod1/ch2\"}"); }),
              unknown + "Mod1/ch2");
    EXPECT_EQ(failureOf([] { check("{\"nvmem_area\":\"Mod1\"}"); }), unknown + "Mod1");
}

TEST_F(RequestResourceTest, RefusesTheFirstOfSeveralUnknownNamesInALongList) {
    Calls names;
    std::string requested = "Mod0";
    for (int i = 0; i < 100; ++i) {
        names.push_back("Mod" + std::to_string(i));
        requested += ",mod" + std::to_string(i);
    }
    driver.give("getSystemPropertyStringArray(7, \"Sys.Devices\")", names);
    EXPECT_EQ(failureOf([&] { check("{\"devices\":\"" + requested + ",second,Mod1,first\"}"); }),
              unknown + "second");
    EXPECT_EQ(failureOf([&] { check("{\"devices\":\"first," + requested + ",second\"}"); }),
              unknown + "first");
    EXPECT_EQ(check("{\"devices\":\"" + requested + "\"}").joinedNames(), requested);
}

TEST_F(RequestResourceTest, ReportsAnUnreadableListAsAnUnknownName) {
    driver.fail("getGenericPropertyStringArray(7, \"Mod9\", \"Dev.PhysChans\")", -12);
    EXPECT_EQ(failureOf([] { check("{\"physical_channel\":\"Mod9/ch0\"}"); }),
              unknown + "Mod9/ch0");
    driver.reply("getSystemPropertyStringArray", {});
    driver.reply("getSystemPropertyStringArray(7, \"Sys.Devices\")", {Calls{"Mod1"}, -12});
    EXPECT_EQ(failureOf([] { check("{\"device\":\"Mod1\"}"); }), unknown + "Mod1");
}

TEST_F(RequestResourceTest, AcceptsTokensEvenWhenTheListIsUnreadable) {
    driver.fail("getSystemPropertyStringArray(7, \"Sys.Devices\")", -12);
    for (const char* token : {"$ConnectedDevices", "$DefaultDevices", "$DefaultNVMEMAreas",
                              "$DefaultPhysChans", "$ReservedDevices"}) {
        EXPECT_EQ(check(std::string("{\"devices\":\"") + token + "\"}").names(), Calls{token});
    }
    EXPECT_EQ(failureOf([] { check("{\"devices\":\"$reserveddevices\"}"); }),
              unknown + "$reserveddevices");
}

TEST_F(RequestResourceTest, DoesNotLookUpTokensAmongChannels) {
    check("{\"physical_channels\":\"$DefaultPhysChans\"}");
    EXPECT_EQ(driver.takeCalls(), Calls{});
}

TEST_F(RequestResourceTest, IgnoresCaseAndPassesTheNameOnAsRequested) {
    EXPECT_EQ(check("{\"devices\":\"mOD1\"}").joinedNames(), "mOD1");
    EXPECT_EQ(check("{\"physical_channels\":\"Mod1/CH0:1\"}").joinedNames(), "Mod1/CH0:1");
}

TEST_F(RequestResourceTest, UsesTheSessionsDefaultsWithoutCallingTheDriver) {
    const std::pair<ResourceKind, Calls> defaults[] = {
        {ResourceKind::None, {}},
        {ResourceKind::Device, {"$DefaultDevices"}},
        {ResourceKind::PhysicalChannel, {"$DefaultPhysChans"}},
        {ResourceKind::NvmemArea, {"$DefaultNVMEMAreas"}}};
    for (const auto& [kind, names] : defaults) {
        const RequestResource resource = check("{}", kind);
        EXPECT_EQ(resource.kind(), kind);
        EXPECT_EQ(resource.names(), names);
    }
    EXPECT_EQ(driver.takeCalls(), Calls{});
}

TEST_F(RequestResourceTest, AppliesNoDefaultToAnEmptyArray) {
    const RequestResource resource = check("{\"devices\":[]}", ResourceKind::PhysicalChannel);
    EXPECT_EQ(resource.kind(), ResourceKind::Device);
    EXPECT_EQ(resource.names(), Calls{});
    EXPECT_EQ(resource.joinedNames(), "");
}

TEST_F(RequestResourceTest, LimitsHowManyNamesRangesExpandTo) {
    std::string parts = "Mod1/ch0:1023";
    for (int i = 0; i < 100; ++i) {
        parts += ",Mod1/ch0:1023";
    }
    EXPECT_EQ(failureOf([&] { read("{\"physical_channels\":\"" + parts + "\"}"); }),
              unknown + "Mod1/ch0:1023");
    std::string elements = "\"Mod1/ch0:1023\"";
    for (int i = 0; i < 100; ++i) {
        elements += ",\"Mod1/ch0:1023\"";
    }
    EXPECT_EQ(failureOf([&] { read("{\"physical_channels\":[" + elements + "]}"); }),
              unknown + "Mod1/ch0:1023");
}

}  // namespace
