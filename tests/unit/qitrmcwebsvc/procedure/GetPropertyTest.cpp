#include <limits>

#include "support/ProcedureFixture.h"

namespace {

class GetPropertyTest : public ProcedureFixture {
  protected:
    void SetUp() override {
        ProcedureFixture::SetUp();
        openSession();
    }
};

// ---- The JSON form of each type -----------------------------------------------------------------

struct ValueCase {
    int dataType;
    const char* read;  // the driver's function
    RecordingDriver::Value value;
    const char* result;
};

class GetPropertyValueTest : public GetPropertyTest,
                             public testing::WithParamInterface<ValueCase> {};

TEST_P(GetPropertyValueTest, ReturnsTheTypeAndThenTheValue) {
    giveDataType(GetParam().dataType);
    give(GetParam().read, GetParam().value);
    EXPECT_EQ(ask("getProperty", R"("property":"Dev.Own","devices":"Mod1")"), GetParam().result);
    const Calls calls = afterOpening(driver.takeCalls());
    ASSERT_GE(calls.size(), 3u);
    EXPECT_EQ(calls[0], std::string(GetParam().read) + "(7, \"Mod1\", \"Dev.Own\")");
    EXPECT_EQ(calls[calls.size() - 2], "translateStaticEnumValueToString(\"DataType\", " +
                                           std::to_string(GetParam().dataType) + ")");
    EXPECT_EQ(calls.back(), "closeProperty(22)");
}

using Doubles = std::vector<double>;
using Int64s = std::vector<std::int64_t>;
using UInt64s = std::vector<std::uint64_t>;
constexpr std::uint64_t maxUInt64 = std::numeric_limits<std::uint64_t>::max();
constexpr std::int64_t minInt64 = std::numeric_limits<std::int64_t>::min();

INSTANTIATE_TEST_SUITE_P(
    Types, GetPropertyValueTest,
    testing::Values(ValueCase{1, "getGenericPropertyBool", std::uint64_t{1},
                              R"({"data_type":"Bool","value":true})"},
                    ValueCase{2, "getGenericPropertyDouble", 1.0,
                              R"({"data_type":"Double","value":1.0})"},
                    ValueCase{3, "getGenericPropertyInt32", std::int64_t{-2147483648},
                              R"({"data_type":"Int32","value":-2147483648})"},
                    ValueCase{4, "getGenericPropertyInt64", minInt64,
                              R"({"data_type":"Int64","value":-9223372036854775808})"},
                    ValueCase{5, "getGenericPropertyString", std::string("a\"\xc3\xa4"),
                              "{\"data_type\":\"String\",\"value\":\"a\\\"\xc3\xa4\"}"},
                    ValueCase{6, "getGenericPropertyUInt32", std::uint64_t{4294967295},
                              R"({"data_type":"UInt32","value":4294967295})"},
                    ValueCase{7, "getGenericPropertyUInt64", maxUInt64,
                              R"({"data_type":"UInt64","value":18446744073709551615})"},
                    ValueCase{8, "getGenericPropertyBoolArray", UInt64s{0, 7},
                              R"({"data_type":"BoolArray","value":[false,true]})"},
                    ValueCase{9, "getGenericPropertyDoubleArray", Doubles{0.5, 2},
                              R"({"data_type":"DoubleArray","value":[0.5,2.0]})"},
                    ValueCase{10, "getGenericPropertyInt32Array", Int64s{-1, 2},
                              R"({"data_type":"Int32Array","value":[-1,2]})"},
                    ValueCase{11, "getGenericPropertyInt64Array", Int64s{9007199254740993},
                              R"({"data_type":"Int64Array","value":[9007199254740993]})"},
                    ValueCase{12, "getGenericPropertyStringArray", Texts{"b", "", "a"},
                              R"({"data_type":"StringArray","value":["b","","a"]})"},
                    ValueCase{13, "getGenericPropertyUInt32Array", UInt64s{4294967295},
                              R"({"data_type":"UInt32Array","value":[4294967295]})"},
                    ValueCase{14, "getGenericPropertyUInt64Array", UInt64s{maxUInt64, 0},
                              R"({"data_type":"UInt64Array","value":[18446744073709551615,0]})"}));

class GetPropertyEmptyArrayTest : public GetPropertyTest,
                                  public testing::WithParamInterface<int> {};

TEST_P(GetPropertyEmptyArrayTest, AnEmptyArrayOfTheDriverIsAnEmptyArray) {
    giveDataType(GetParam());
    const std::string result = ask("getProperty", R"("property":"Dev.Own","devices":"Mod1")");
    EXPECT_NE(result.find(R"("value":[])"), std::string::npos) << result;
}

INSTANTIATE_TEST_SUITE_P(ArrayTypes, GetPropertyEmptyArrayTest, testing::Range(8, 15));

// ---- The sequence of calls
// -----------------------------------------------------------------------

TEST_F(GetPropertyTest, CallsTheDriverInThisOrder) {
    giveDataType(12);
    give("getSystemPropertyStringArray(7, \"Sys.Devices\")", Texts{"Mod1"});
    give("getGenericPropertyStringArray(7, \"Mod1\", \"Dev.Name\")", Texts{"a", "b"});
    EXPECT_EQ(ask("getProperty", R"("property":"Dev.Name","devices":["Mod1"])"),
              R"({"data_type":"StringArray","value":["a","b"]})");
    EXPECT_EQ(
        driver.takeCalls(),
        (Calls{"getSystemPropertyStringArray(7, \"Sys.Devices\")", "freeStringArray(1)",
               "getSystemPropertyStringArray(7, \"Sys.SessionProperties\")", "freeStringArray(4)",
               "getSystemPropertyStringArray(7, \"Sys.SystemProperties\")", "freeStringArray(5)",
               "getSystemPropertyStringArray(7, \"Sys.DeviceProperties\")", "freeStringArray(3)",
               "openDriverDefinedProperty(7, \"Dev.Name\")",
               "getPropertyPropertyInt32(21, \"Prop.DataType\")",
               "getGenericPropertyStringArray(7, \"Mod1\", \"Dev.Name\")", "freeStringArray(2)",
               "translateStaticEnumValueToString(\"DataType\", 12)", "closeProperty(21)"}));
}

TEST_F(GetPropertyTest, AScalarOnTwoDevicesIsAnArrayOfItsType) {
    giveDataType(3);
    give("getGenericPropertyInt32Array(7, \"Mod1,Mod2\", \"Dev.Own\")", Int64s{5, -6});
    EXPECT_EQ(ask("getProperty", R"("property":"Dev.Own","devices":["Mod1","Mod2"])"),
              R"({"data_type":"Int32Array","value":[5,-6]})");
}

TEST_F(GetPropertyTest, AnArrayOnTwoDevicesIsRefused) {
    giveDataType(10);
    EXPECT_EQ(ask("getProperty", R"("property":"Dev.Own","devices":["Mod1","Mod2"])"),
              failure(-250829, "kUsageTypeDevices", "Mod1,Mod2"));
    EXPECT_EQ(driver.calls().back(), "closeProperty(22)");
}

TEST_F(GetPropertyTest, ASystemPropertyNeedsNoResources) {
    giveDataType(7);
    give("getSystemPropertyUInt64(7, \"Sys.Ticks\")", maxUInt64);
    EXPECT_EQ(ask("getProperty", R"("property":"Sys.Ticks")"),
              R"({"data_type":"UInt64","value":18446744073709551615})");
}

TEST_F(GetPropertyTest, ASessionPropertyOfTypeStringCannotBeRead) {
    giveDataType(5);
    EXPECT_EQ(ask("getProperty", R"("property":"Session.Name")"),
              internalError("Unsupported property category."));
    EXPECT_EQ(driver.calls().back(), "closeProperty(21)");
}

TEST_F(GetPropertyTest, ANameThatIsNotASystemPropertyNeedsResources) {
    EXPECT_EQ(ask("getProperty", R"("property":"Dev.Own")"),
              failure(-32602, "kUsageTypeDetails",
                      "You must specify at least one of the following parameters: devices, "
                      "physical_channels, nvmem_areas."));
}

TEST_F(GetPropertyTest, TheDefaultResourcesOfTheSessionAreUsed) {
    openSession(R"("nvmem_areas":"Mod1/user")");
    giveDataType(6);
    give("getSessionPropertyStringArray(7, \"Session.DefaultNVMEMAreas\")", Texts{"Mod1/user"});
    give("getGenericPropertyUInt32(7, \"Mod1/user\", \"NVMEM.Size\")", std::uint64_t{64});
    EXPECT_EQ(ask("getProperty", R"("property":"NVMEM.Size")"),
              R"({"data_type":"UInt32","value":64})");
}

TEST_F(GetPropertyTest, AnUnknownDataTypeIsAnInternalError) {
    for (const int number : {0, 15, -1}) {
        giveDataType(number);
        EXPECT_EQ(ask("getProperty", R"("property":"Dev.Own","devices":"Mod1")"),
                  internalError("Unsupported data type for dynamic property."));
        EXPECT_EQ(afterOpening(driver.takeCalls()), Calls{"closeProperty(22)"});
    }
}

TEST_F(GetPropertyTest, TwoKindsOfResourcesAreRefusedByTheSchema) {
    EXPECT_EQ(ask("getProperty", R"("property":"x","devices":"Mod1","nvmem_areas":"Mod1/user")"),
              R"(-32602 [{"type":"usage","usage":"kUsageTypeParameter","value":"#/params",)"
              R"("value_type":"string"},{"type":"usage","usage":"kUsageTypeDetails",)"
              R"("value":"You must specify none or only one of the following parameters: devices, )"
              R"(physical_channels, nvmem_areas.","value_type":"string"}])");
    EXPECT_EQ(driver.takeCalls(), Calls{});
}

}  // namespace
