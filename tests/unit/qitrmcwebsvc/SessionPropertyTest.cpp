#include "qitrmcwebsvc/SessionProperty.h"

#include "qitrmcsharedcmn/Exceptions.h"
#include "support/ProcedureFixture.h"

using namespace nQITRMCWEBSVC100;

namespace {

const std::string readNames = "getSystemPropertyStringArray(7, \"Sys.";

class SessionPropertyTest : public ProcedureFixture {
  protected:
    // The resources in params with this text.
    static RequestResource resources(const std::string& params) {
        JsonDocument document;
        document.Parse(params.c_str());
        return RequestResource(document);
    }

    SessionProperty open(const std::string& name, const std::string& params = "{}") {
        return SessionProperty(session, name, resources(params));
    }

    // The failure to open the property: code and details, in the form of ProcedureFixture.
    std::string refusal(const std::string& name, const std::string& params = "{}") {
        return refusalOf([&] { open(name, params); });
    }

    template <typename Act>
    std::string refusalOf(Act act) {
        try {
            act();
        } catch (const qierr::ExceptionBase& error) {
            return std::to_string(error.status()->code) + " " + error.ExceptionBase::what();
        }
        return "none";
    }

    const std::shared_ptr<SessionContext> session =
        std::make_shared<SessionContext>(SessionContext{ResourceKind::None, 0, 7});
};

void expectHolds(const std::string& text, const std::string& part) {
    EXPECT_NE(text.find(part), std::string::npos) << text;
}

// ---- Category and opening -----------------------------------------------------------------------

TEST_F(SessionPropertyTest, ASessionPropertyIgnoresADeviceInTheRequest) {
    giveDataType(12);
    const SessionProperty property = open("Session.ReservedDevices", R"({"devices":"Mod1"})");
    EXPECT_EQ(property.category(), PropertyCategory::Session);
    EXPECT_TRUE(property.isDriverDefined());
    EXPECT_EQ(property.dataType(), 12);
    EXPECT_EQ(driver.takeCalls(),
              (Calls{readNames + "SessionProperties\")", "freeStringArray(4)",
                     "openDriverDefinedProperty(7, \"Session.ReservedDevices\")",
                     "getPropertyPropertyInt32(21, \"Prop.DataType\")"}));
}

TEST_F(SessionPropertyTest, SessionNamesTakePrecedenceOverSystemNames) {
    give(readNames + "SystemProperties\")", Texts{"Session.Timeout"});
    EXPECT_EQ(open("Session.Timeout").category(), PropertyCategory::Session);
}

TEST_F(SessionPropertyTest, SystemNamesTakePrecedenceOverResources) {
    const SessionProperty property = open("Sys.Delay", R"({"devices":"Mod1"})");
    EXPECT_EQ(property.category(), PropertyCategory::System);
    EXPECT_TRUE(property.isDriverDefined());
    EXPECT_EQ(driver.takeCalls(), (Calls{readNames + "SessionProperties\")", "freeStringArray(4)",
                                         readNames + "SystemProperties\")", "freeStringArray(5)",
                                         "openDriverDefinedProperty(7, \"Sys.Delay\")",
                                         "getPropertyPropertyInt32(21, \"Prop.DataType\")"}));
}

TEST_F(SessionPropertyTest, APropertyInTheListOfDevicesIsOpenedAsDriverDefined) {
    const SessionProperty property = open("Dev.Name", R"({"devices":"Mod1"})");
    EXPECT_EQ(property.category(), PropertyCategory::Device);
    EXPECT_TRUE(property.isDriverDefined());
    EXPECT_EQ(driver.takeCalls(), (Calls{readNames + "SessionProperties\")", "freeStringArray(4)",
                                         readNames + "SystemProperties\")", "freeStringArray(5)",
                                         readNames + "DeviceProperties\")", "freeStringArray(3)",
                                         "openDriverDefinedProperty(7, \"Dev.Name\")",
                                         "getPropertyPropertyInt32(21, \"Prop.DataType\")"}));
}

TEST_F(SessionPropertyTest, APropertyInNoListIsOpenedOnTheFirstResource) {
    const SessionProperty property = open("Dev.Own", R"({"devices":["Mod2","Mod1"]})");
    EXPECT_FALSE(property.isDriverDefined());
    EXPECT_EQ(driver.calls()[6], "openGenericProperty(7, \"Mod2\", \"Dev.Own\")");
}

TEST_F(SessionPropertyTest, TheKindOfTheResourcesDeterminesTheCategoryOfOtherNames) {
    EXPECT_EQ(open("PhysChan.Range", R"({"physical_channels":"Mod1/ch0"})").category(),
              PropertyCategory::PhysChan);
    EXPECT_EQ(open("NVMEM.Size", R"({"nvmem_areas":"Mod1/user"})").category(),
              PropertyCategory::NvmemArea);
    EXPECT_TRUE(open("NVMEM.Size", R"({"nvmem_area":"Mod1/user"})").isDriverDefined());
    EXPECT_FALSE(open("Dev.Name", R"({"physical_channel":"Mod1/ch0"})").isDriverDefined());
}

TEST_F(SessionPropertyTest, AHiddenNameIsInNoListAndSoNeedsResources) {
    const std::string text = refusal("Session.Language");
    expectHolds(text, "-32602 ");
    expectHolds(text,
                R"("ordered_data":[{"type":"usage","usage":"kUsageTypeDetails","value":"You must )"
                R"(specify at least one of the following parameters: devices, physical_channels, )"
                R"(nvmem_areas.","value_type":"string"}])");
}

TEST_F(SessionPropertyTest, AHiddenNameOfDevicesIsOpenedAsTheirOwn) {
    EXPECT_FALSE(open("Dev.Events", R"({"devices":"Mod1"})").isDriverDefined());
    EXPECT_EQ(driver.calls()[6], "openGenericProperty(7, \"Mod1\", \"Dev.Events\")");
}

TEST_F(SessionPropertyTest, NamesAreComparedByteForByte) {
    EXPECT_FALSE(open("dev.name", R"({"devices":"Mod1"})").isDriverDefined());
    expectHolds(refusal("session.timeout"), "-32602 ");
}

TEST_F(SessionPropertyTest, AnUnknownNameWithADeviceFailsWithTheDriversError) {
    fail("openGenericProperty", -250820, R"({"from":"driver"})");
    EXPECT_EQ(refusal("Dev.Nothing", R"({"devices":"Mod1"})"), R"(-250820 {"from":"driver"})");
    EXPECT_EQ(driver.calls().back(), "openGenericProperty(7, \"Mod1\", \"Dev.Nothing\")");
}

TEST_F(SessionPropertyTest, TheHandleIsClosedAtTheEndAndItsStatusIsDropped) {
    fail("closeProperty", -250999);
    open("Dev.Name", R"({"devices":"Mod1"})");
    EXPECT_EQ(driver.calls().back(), "closeProperty(21)");
}

TEST_F(SessionPropertyTest, TheHandleIsClosedWhenTheDataTypeCannotBeRead) {
    fail("getPropertyPropertyInt32", -250830);
    expectHolds(refusal("Dev.Own", R"({"devices":"Mod1"})"), "-250830 ");
    EXPECT_EQ(driver.calls().back(), "closeProperty(22)");
}

TEST_F(SessionPropertyTest, AListThatTheDriverRefusesIsTheFailure) {
    fail(readNames + "SystemProperties\")", -250831);
    expectHolds(refusal("Dev.Own", R"({"devices":"Mod1"})"), "-250831 ");
    EXPECT_EQ(driver.calls().back(), "freeStringArray(null)");
}

// ---- Tokens -------------------------------------------------------------------------------------

struct TokenCase {
    const char* token;
    const char* property;
};

class SessionPropertyTokenTest : public SessionPropertyTest,
                                 public testing::WithParamInterface<TokenCase> {};

TEST_P(SessionPropertyTokenTest, ATokenIsReplacedByTheContentOfItsSessionProperty) {
    const std::string call =
        std::string("getSessionPropertyStringArray(7, \"") + GetParam().property + "\")";
    give(call, Texts{"A", "B"});
    giveDataType(3);
    const SessionProperty property =
        open("Dev.Own", std::string(R"({"devices":["Mod1",")") + GetParam().token + "\"]}");
    EXPECT_EQ(property.dataType(), 10);
    property.getInt32Array();
    const Calls calls = driver.calls();
    EXPECT_EQ(
        Calls(calls.begin() + 6, calls.end()),
        (Calls{call, "freeStringArray(2)", "openGenericProperty(7, \"Mod1\", \"Dev.Own\")",
               "getPropertyPropertyInt32(22, \"Prop.DataType\")",
               "getGenericPropertyInt32Array(7, \"Mod1,A,B\", \"Dev.Own\")", "freeArray(null)"}));
}

INSTANTIATE_TEST_SUITE_P(AllTokens, SessionPropertyTokenTest,
                         testing::Values(TokenCase{"$ConnectedDevices", "Session.ConnectedDevices"},
                                         TokenCase{"$DefaultDevices", "Session.DefaultDevices"},
                                         TokenCase{"$DefaultNVMEMAreas",
                                                   "Session.DefaultNVMEMAreas"},
                                         TokenCase{"$DefaultPhysChans", "Session.DefaultPhysChans"},
                                         TokenCase{"$ReservedDevices", "Session.ReservedDevices"}));

TEST_F(SessionPropertyTest, ATokenForNoResourcesLeavesAnEmptyListWithTheRulesOfOneResource) {
    give("getSessionPropertyStringArray(7, \"Session.ReservedDevices\")", Texts{});
    giveDataType(3);
    const SessionProperty property = open("Dev.Own", R"({"devices":"$ReservedDevices"})");
    EXPECT_EQ(property.dataType(), 3);
    property.getInt32();
    const Calls calls = driver.calls();
    EXPECT_EQ(calls[8], "openGenericProperty(7, \"\", \"Dev.Own\")");
    EXPECT_EQ(calls[10], "getGenericPropertyInt32(7, \"\", \"Dev.Own\")");
}

TEST_F(SessionPropertyTest, EmptyNamesAreDropped) {
    giveDataType(3);
    const SessionProperty property = open("Dev.Own", R"({"devices":",Mod2,"})");
    EXPECT_EQ(property.dataType(), 3);
    EXPECT_EQ(driver.calls()[6], "openGenericProperty(7, \"Mod2\", \"Dev.Own\")");
}

TEST_F(SessionPropertyTest, TokensOfASessionPropertyAreNotReplaced) {
    open("Session.Timeout", R"({"devices":"$ReservedDevices"})");
    for (const std::string& call : driver.calls()) {
        EXPECT_EQ(call.find("getSessionPropertyStringArray"), std::string::npos) << call;
    }
}

TEST_F(SessionPropertyTest, ATokenThatCannotBeReadIsTheFailure) {
    fail("getSessionPropertyStringArray", -250840);
    expectHolds(refusal("Dev.Own", R"({"devices":"$DefaultDevices"})"), "-250840 ");
    EXPECT_EQ(driver.calls().back(), "freeStringArray(null)");
}

// ---- Data types ---------------------------------------------------------------------------------

TEST_F(SessionPropertyTest, EachScalarTypeOnTwoDevicesBecomesItsArray) {
    for (std::int32_t number = 1; number <= 7; ++number) {
        giveDataType(number);
        const SessionProperty one = open("Dev.Own", R"({"devices":"Mod1"})");
        EXPECT_EQ(one.dataType(), number);
        EXPECT_TRUE(one.isScalar());
        EXPECT_FALSE(one.isArray());
        const SessionProperty two = open("Dev.Own", R"({"devices":"Mod1,Mod2"})");
        EXPECT_EQ(two.dataType(), number + 7);
        EXPECT_FALSE(two.isScalar());
        EXPECT_TRUE(two.isArray());
    }
}

TEST_F(SessionPropertyTest, EachArrayTypeOnTwoDevicesIsRefusedWithTheirNames) {
    for (std::int32_t number = 8; number <= 14; ++number) {
        giveDataType(number);
        EXPECT_EQ(open("Dev.Own", R"({"devices":"Mod1"})").dataType(), number);
        const std::string text = refusal("Dev.Own", R"({"devices":"Mod1,Mod2"})");
        expectHolds(text, "-250829 ");
        expectHolds(text, R"("ordered_data":[{"type":"usage","usage":"kUsageTypeDevices",)"
                          R"("value":"Mod1,Mod2","value_type":"string"}])");
        EXPECT_EQ(driver.calls().back(), "closeProperty(22)");
    }
}

TEST_F(SessionPropertyTest, AnUnknownTypeIsNeitherScalarNorArrayAndIsUnchanged) {
    for (const std::int32_t number : {-1, 0, 15, 100}) {
        giveDataType(number);
        const SessionProperty property = open("Dev.Own", R"({"devices":"Mod1,Mod2"})");
        EXPECT_EQ(property.dataType(), number);
        EXPECT_FALSE(property.isScalar());
        EXPECT_FALSE(property.isArray());
    }
}

TEST_F(SessionPropertyTest, ASessionPropertyIsNotSpreadOverDevices) {
    giveDataType(12);
    EXPECT_EQ(open("Session.ReservedDevices", R"({"devices":"Mod1,Mod2"})").dataType(), 12);
}

TEST_F(SessionPropertyTest, ChannelsArePassedToTheDriverInTheirShortForm) {
    giveDataType(2);
    const SessionProperty property =
        open("PhysChan.Range", R"({"physical_channels":["Mod1/ch0:1","Mod1/ch2"]})");
    give("getGenericPropertyDoubleArray", std::vector<double>{1.5, 2.5, 3.5});
    EXPECT_EQ(property.getDoubleArray(), (std::vector<double>{1.5, 2.5, 3.5}));
    EXPECT_EQ(driver.calls()[driver.calls().size() - 2],
              "getGenericPropertyDoubleArray(7, \"Mod1/ch0:2\", \"PhysChan.Range\")");
}

// ---- Attributes ---------------------------------------------------------------------------------

TEST_F(SessionPropertyTest, AttributesAreReadThroughTheHandle) {
    const SessionProperty property = open("Dev.Own", R"({"devices":"Mod1"})");
    give("getPropertyPropertyInt32", std::int64_t{-5});
    give("getPropertyPropertyBool", std::uint64_t{2});
    give("getPropertyPropertyString", std::string("V"));
    give("getPropertyPropertyInt32Array", std::vector<std::int64_t>{-1, 4});
    give("getPropertyPropertyStringArray", Texts{"a", "b", "c"});
    driver.takeCalls();
    EXPECT_EQ(property.metaInt32("Prop.Access"), -5);
    EXPECT_TRUE(property.metaBool("Prop.IsEnum"));
    EXPECT_EQ(property.metaString("Prop.Unit"), "V");
    EXPECT_EQ(property.metaInt32Array("Prop.Enum.Values"), (std::vector<std::int32_t>{-1, 4}));
    EXPECT_EQ(property.metaStringArray("Prop.Enum.ValueNames"), (Texts{"a", "b", "c"}));
    EXPECT_EQ(driver.takeCalls(),
              (Calls{"getPropertyPropertyInt32(22, \"Prop.Access\")",
                     "getPropertyPropertyBool(22, \"Prop.IsEnum\")",
                     "getPropertyPropertyString(22, \"Prop.Unit\")", "freeString()",
                     "getPropertyPropertyInt32Array(22, \"Prop.Enum.Values\")", "freeArray()",
                     "getPropertyPropertyStringArray(22, \"Prop.Enum.ValueNames\")",
                     "freeStringArray(3)"}));
}

}  // namespace
