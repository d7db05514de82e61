#include "support/ProcedureFixture.h"

namespace {

const std::string question = R"("property":"Dev.Own","device":"Mod1")";

class PropertyInformationTest : public ProcedureFixture {
  protected:
    void SetUp() override {
        ProcedureFixture::SetUp();
        openSession();
        giveDataType(3);
        give(attribute("Int32", "Prop.Access"), std::int64_t{3});
        give("translateStaticEnumValueToString(\"PropertyAccess\", 3)", std::string("ReadWrite"));
    }

    static std::string attribute(const std::string& type, const std::string& name) {
        return "getPropertyProperty" + type + "(22, \"" + name + "\")";
    }

    void giveText(const std::string& name, const std::string& text) {
        give(attribute("String", name), text);
    }

    void giveEnum(const Texts& names, const std::vector<std::int64_t>& values) {
        give(attribute("Bool", "Prop.IsEnum"), std::uint64_t{1});
        giveText("Prop.Enum.Name", "Mode");
        give(attribute("StringArray", "Prop.Enum.ValueNames"), names);
        give(attribute("Int32Array", "Prop.Enum.Values"), values);
    }
};

TEST_F(PropertyInformationTest, APropertyWithoutTextsHasOnlyTheFourRequiredMembers) {
    for (const char* name :
         {"Prop.Descr", "Prop.Doc", "Prop.MaxValue", "Prop.MinValue", "Prop.Unit"}) {
        giveText(name, "");
    }
    EXPECT_EQ(ask("getPropertyInformation", question),
              R"({"data_type":"Int32","access":"ReadWrite","driver_defined":false,)"
              R"("pending_changes":false})");
}

TEST_F(PropertyInformationTest, TextsComeFirstInTheOrderOfTheirKeysAndLimitsAreTexts) {
    giveText("Prop.Descr", "Gain");
    giveText("Prop.Doc", "The gain.");
    giveText("Prop.MaxValue", "10");
    giveText("Prop.MinValue", "-10");
    giveText("Prop.Unit", "dB");
    give(attribute("Bool", "Prop.PendingChanges"), std::uint64_t{1});
    EXPECT_EQ(ask("getPropertyInformation", question),
              R"({"description":"Gain","document":"The gain.","max_value":"10",)"
              R"("min_value":"-10","unit":"dB","data_type":"Int32","access":"ReadWrite",)"
              R"("driver_defined":false,"pending_changes":true})");
}

TEST_F(PropertyInformationTest, ATextThatTheDriverDoesNotReturnIsLeftOut) {
    giveText("Prop.Unit", "dB");
    EXPECT_EQ(ask("getPropertyInformation", question),
              R"({"unit":"dB","data_type":"Int32","access":"ReadWrite","driver_defined":false,)"
              R"("pending_changes":false})");
}

TEST_F(PropertyInformationTest, AnEnumeratedPropertyHasItsItemsLastInTheDriversOrder) {
    giveEnum({"Slow", "Fast", "Off"}, {2, 1, -1});
    EXPECT_EQ(ask("getPropertyInformation", question),
              R"({"data_type":"Int32","access":"ReadWrite","driver_defined":false,)"
              R"("pending_changes":false,)"
              R"("enum":{"name":"Mode","values":{"Slow":2,"Fast":1,"Off":-1}}})");
}

TEST_F(PropertyInformationTest, AnEnumeratedPropertyWithoutItemsHasAnEmptyObject) {
    giveEnum({}, {});
    EXPECT_EQ(ask("getPropertyInformation", question),
              R"({"data_type":"Int32","access":"ReadWrite","driver_defined":false,)"
              R"("pending_changes":false,"enum":{"name":"Mode","values":{}}})");
}

TEST_F(PropertyInformationTest, ItemsWithoutNameOrNumberAreHandled) {
    giveEnum({"Slow"}, {2, 1});
    EXPECT_EQ(ask("getPropertyInformation", question),
              R"({"data_type":"Int32","access":"ReadWrite","driver_defined":false,)"
              R"("pending_changes":false,"enum":{"name":"Mode","values":{"Slow":2}}})");
    giveEnum({"Slow", "Fast"}, {2});
    EXPECT_EQ(ask("getPropertyInformation", question),
              R"({"data_type":"Int32","access":"ReadWrite","driver_defined":false,)"
              R"("pending_changes":false,"enum":{"name":"Mode","values":{"Slow":2}}})");
}

TEST_F(PropertyInformationTest, ReportsThatTheDriverDefinesAProperty) {
    give("getPropertyPropertyInt32(21, \"Prop.Access\")", std::int64_t{3});
    EXPECT_EQ(ask("getPropertyInformation", R"("property":"Sys.Delay")"),
              R"({"data_type":"Int32","access":"ReadWrite","driver_defined":true,)"
              R"("pending_changes":false})");
}

TEST_F(PropertyInformationTest, CallsTheDriverInThisOrder) {
    giveEnum({"Slow"}, {2});
    giveText("Prop.Doc", "The gain.");
    ask("getPropertyInformation", question);
    const Calls calls = driver.takeCalls();
    ASSERT_GE(calls.size(), 10u);
    EXPECT_EQ(
        Calls(calls.begin(), calls.begin() + 10),
        (Calls{"getSystemPropertyStringArray(7, \"Sys.Devices\")", "freeStringArray(4)",
               "getSystemPropertyStringArray(7, \"Sys.SessionProperties\")", "freeStringArray(4)",
               "getSystemPropertyStringArray(7, \"Sys.SystemProperties\")", "freeStringArray(5)",
               "getSystemPropertyStringArray(7, \"Sys.DeviceProperties\")", "freeStringArray(3)",
               "openGenericProperty(7, \"Mod1\", \"Dev.Own\")",
               attribute("Int32", "Prop.DataType")}));
    EXPECT_EQ(Calls(calls.begin() + 10, calls.end()),
              (Calls{attribute("String", "Prop.Descr"),
                     "freeString(null)",
                     attribute("String", "Prop.Doc"),
                     "freeString()",
                     attribute("String", "Prop.MaxValue"),
                     "freeString(null)",
                     attribute("String", "Prop.MinValue"),
                     "freeString(null)",
                     attribute("String", "Prop.Unit"),
                     "freeString(null)",
                     attribute("Int32", "Prop.DataType"),
                     "translateStaticEnumValueToString(\"DataType\", 3)",
                     attribute("Int32", "Prop.Access"),
                     "translateStaticEnumValueToString(\"PropertyAccess\", 3)",
                     attribute("Bool", "Prop.PendingChanges"),
                     attribute("Bool", "Prop.IsEnum"),
                     attribute("String", "Prop.Enum.Name"),
                     "freeString()",
                     attribute("StringArray", "Prop.Enum.ValueNames"),
                     "freeStringArray(1)",
                     attribute("Int32Array", "Prop.Enum.Values"),
                     "freeArray()",
                     "closeProperty(22)"}));
}

TEST_F(PropertyInformationTest, ReportsTheTypeForOneResourceEvenWhenSeveralAreNamed) {
    EXPECT_EQ(ask("getPropertyInformation", R"("property":"Dev.Own","device":"Mod1,Mod2")"),
              R"({"data_type":"Int32","access":"ReadWrite","driver_defined":false,)"
              R"("pending_changes":false})");
}

TEST_F(PropertyInformationTest, AFailureToReadADescriptionIsNotAnEmptyDescription) {
    fail(attribute("String", "Prop.Descr"), -250999);
    EXPECT_EQ(ask("getPropertyInformation", question), "-250999");
    EXPECT_EQ(driver.calls().back(), "closeProperty(22)");
}

TEST_F(PropertyInformationTest, TwoResourcesAreRefusedByTheSchema) {
    EXPECT_EQ(ask("getPropertyInformation", question + R"(,"physical_channel":"Mod1/ch0")"),
              R"(-32602 [{"type":"usage","usage":"kUsageTypeParameter","value":"#/params",)"
              R"("value_type":"string"},{"type":"usage","usage":"kUsageTypeDetails",)"
              R"("value":"You must specify none or only one of the following parameters: device, )"
              R"(physical_channel, nvmem_area.","value_type":"string"}])");
}

}  // namespace
