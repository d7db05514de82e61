#include "qitrmcwebsvc/ResourceUtility.h"

#include "qierr/Exception.h"
#include "support/ProcedureFixture.h"

using namespace nQITRMCWEBSVC100;

namespace {

class ResourceUtilityTest : public ProcedureFixture {
  protected:
    // The result of the check for these resources: "true", "false", or the failure's code and
    // details.
    std::string isChassis(const std::string& params) {
        JsonDocument document;
        document.Parse(params.c_str());
        const auto session =
            std::make_shared<SessionContext>(SessionContext{ResourceKind::None, 0, 7});
        const RequestResource resource(document, 7, defaultKind);
        try {
            return isDeviceOfCategory(resource, session, 1) ? "true" : "false";
        } catch (const qierr::ExceptionBase& error) {
            return std::to_string(error.status()->code) + error.status()->json;
        }
    }

    void expectOneDeviceWanted(const std::string& params) {
        const std::string text = isChassis(params);
        EXPECT_EQ(text.rfind("-32602", 0), 0u) << text;
        EXPECT_NE(text.find(R"("ordered_data":[{"type":"usage","usage":"kUsageTypeDetails",)"
                            R"("value":"You must specify none or only one device.",)"
                            R"("value_type":"string"}])"),
                  std::string::npos)
            << text;
    }

    ResourceKind defaultKind = ResourceKind::None;
};

TEST_F(ResourceUtilityTest, ADeviceIsOfTheCategoryThatItsPropertyGives) {
    giveDataType(3);
    give("getGenericPropertyInt32(7, \"Bench\", \"Dev.ProductCategory\")", std::int64_t{1});
    give("getGenericPropertyInt32(7, \"Mod1\", \"Dev.ProductCategory\")", std::int64_t{2});
    EXPECT_EQ(isChassis(R"({"device":"Bench"})"), "true");
    EXPECT_EQ(driver.calls().back(), "closeProperty(22)");
    EXPECT_EQ(isChassis(R"({"device":"Mod1"})"), "false");
}

TEST_F(ResourceUtilityTest, ATextThatExpandsToTwoDevicesIsRefused) {
    expectOneDeviceWanted(R"({"device":"Mod1,Mod2"})");
}

TEST_F(ResourceUtilityTest, NoDeviceIsRefused) {
    expectOneDeviceWanted("{}");
    expectOneDeviceWanted(R"({"devices":[]})");
}

TEST_F(ResourceUtilityTest, AnotherKindOfResourceIsRefused) {
    expectOneDeviceWanted(R"({"physical_channel":"Mod1/ch0"})");
    defaultKind = ResourceKind::NvmemArea;
    expectOneDeviceWanted("{}");
}

TEST_F(ResourceUtilityTest, TheDefaultDevicesCountAsOneName) {
    defaultKind = ResourceKind::Device;
    giveDataType(3);
    give("getSessionPropertyStringArray(7, \"Session.DefaultDevices\")", Texts{"Bench"});
    give("getGenericPropertyInt32(7, \"Bench\", \"Dev.ProductCategory\")", std::int64_t{1});
    EXPECT_EQ(isChassis("{}"), "true");
}

TEST_F(ResourceUtilityTest, APropertyThatCannotBeReadIsTheFailure) {
    fail("getGenericPropertyInt32", -250850, R"({"from":"driver"})");
    EXPECT_EQ(isChassis(R"({"device":"Bench"})"), R"(-250850{"from":"driver"})");
    EXPECT_EQ(driver.calls().back(), "closeProperty(22)");
}

}  // namespace
