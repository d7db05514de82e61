#include "support/ProcedureFixture.h"

namespace {

class SetPropertyTest : public ProcedureFixture {
  protected:
    void SetUp() override {
        ProcedureFixture::SetUp();
        openSession();
    }

    // Writes Dev.Own of Mod1, which has this data type.
    std::string set(int dataType, const std::string& value) {
        giveDataType(dataType);
        driver.takeCalls();
        return ask("setProperty", R"("property":"Dev.Own","devices":"Mod1","value":)" + value);
    }

    // The write among the latest calls; empty if there is none.
    std::string write() {
        for (const std::string& call : driver.calls()) {
            if (call.rfind("set", 0) == 0) {
                return call;
            }
        }
        return "";
    }
};

std::string wrongType(const std::string& name) {
    return failure(-250819, "kUsageTypeRequestedDataType", name);
}

// ---- Values that a type takes -------------------------------------------------------------------

struct Accepted {
    int dataType;
    const char* value;
    const char* write;  // function and value
    const char* result;
};

class SetPropertyAcceptsTest : public SetPropertyTest,
                               public testing::WithParamInterface<Accepted> {};

TEST_P(SetPropertyAcceptsTest, TheValueAndReturnsTheType) {
    if (GetParam().dataType == 8) {
        expectOwnArray();
    }
    EXPECT_EQ(set(GetParam().dataType, GetParam().value), GetParam().result);
    const std::string function = GetParam().write;
    const std::size_t split = function.find('|');
    EXPECT_EQ(write(), "setGenericProperty" + function.substr(0, split) +
                           "(7, \"Mod1\", \"Dev.Own\", " + function.substr(split + 1) + ")");
    EXPECT_EQ(driver.calls().back(), "closeProperty(22)");
}

#define TYPE(name) "{\"data_type\":\"" #name "\"}"

INSTANTIATE_TEST_SUITE_P(
    Values, SetPropertyAcceptsTest,
    testing::Values(
        Accepted{1, "true", "Bool|1", TYPE(Bool)}, Accepted{1, "false", "Bool|0", TYPE(Bool)},
        Accepted{2, "1", "Double|1", TYPE(Double)}, Accepted{2, "0.5", "Double|0.5", TYPE(Double)},
        Accepted{2, "-9223372036854775808", "Double|-9.2233720368547758e+18", TYPE(Double)},
        Accepted{2, "18446744073709551615", "Double|1.8446744073709552e+19", TYPE(Double)},
        Accepted{2, "1e3", "Double|1000", TYPE(Double)},
        Accepted{3, "-2147483648", "Int32|-2147483648", TYPE(Int32)},
        Accepted{3, "2147483647", "Int32|2147483647", TYPE(Int32)},
        Accepted{3, "[5]", "Int32|5", TYPE(Int32)},
        Accepted{4, "-9223372036854775808", "Int64|-9223372036854775808", TYPE(Int64)},
        Accepted{4, "9223372036854775807", "Int64|9223372036854775807", TYPE(Int64)},
        Accepted{4, "9007199254740993", "Int64|9007199254740993", TYPE(Int64)},
        Accepted{5, R"("text")", R"(String|"text")", TYPE(String)},
        Accepted{5, R"("")", R"(String|"")", TYPE(String)},
        Accepted{5, R"("ab\u0000cd")", R"(String|"ab")", TYPE(String)},
        Accepted{5, R"(["text"])", R"(String|"text")", TYPE(String)},
        Accepted{6, "0", "UInt32|0", TYPE(UInt32)},
        Accepted{6, "4294967295", "UInt32|4294967295", TYPE(UInt32)},
        Accepted{7, "18446744073709551615", "UInt64|18446744073709551615", TYPE(UInt64)},
        Accepted{7, "-0", "UInt64|0", TYPE(UInt64)},
        Accepted{8, "[true,false]", "BoolArray|[1,0]", TYPE(BoolArray)},
        Accepted{9, "[1,0.5]", "DoubleArray|[1,0.5]", TYPE(DoubleArray)},
        Accepted{10, "[-1,2]", "Int32Array|[-1,2]", TYPE(Int32Array)},
        Accepted{10, "[5]", "Int32Array|[5]", TYPE(Int32Array)},
        Accepted{11, "[-9223372036854775808]", "Int64Array|[-9223372036854775808]",
                 TYPE(Int64Array)},
        Accepted{12, R"(["a","b\u0000c"])", R"(StringArray|["a","b"])", TYPE(StringArray)},
        Accepted{13, "[4294967295,0]", "UInt32Array|[4294967295,0]", TYPE(UInt32Array)},
        Accepted{14, "[18446744073709551615]", "UInt64Array|[18446744073709551615]",
                 TYPE(UInt64Array)}));

// ---- Values that a type refuses -----------------------------------------------------------------

struct Refused {
    int dataType;
    const char* name;
    std::vector<const char*> values;
};

class SetPropertyRefusesTest : public SetPropertyTest,
                               public testing::WithParamInterface<Refused> {};

TEST_P(SetPropertyRefusesTest, ValuesOfOtherTypesAndNamesItsOwn) {
    for (const char* value : GetParam().values) {
        SCOPED_TRACE(value);
        EXPECT_EQ(set(GetParam().dataType, value), wrongType(GetParam().name));
        EXPECT_EQ(write(), "");
        EXPECT_EQ(driver.calls().back(), "closeProperty(22)");
    }
}

INSTANTIATE_TEST_SUITE_P(
    Types, SetPropertyRefusesTest,
    testing::Values(
        Refused{1, "Bool", {"1", "0", "\"true\"", "[true,false]"}},
        Refused{2, "Double", {"\"1\"", "true", "[1,2]"}},
        Refused{3,
                "Int32",
                {"1.0", "1e0", "2147483648", "-2147483649", "[5,6]", "\"5\"", "true", "[1.0]"}},
        Refused{4, "Int64", {"9223372036854775808", "-9223372036854775809", "0.0", "\"1\""}},
        Refused{5, "String", {"1", "false", R"(["a","b"])"}},
        Refused{6, "UInt32", {"-1", "4294967296", "1.0", "\"1\""}},
        Refused{7, "UInt64", {"-1", "18446744073709551616", "1.5"}},
        Refused{8, "BoolArray", {"true", "[1]", R"(["a"])"}},
        Refused{9, "DoubleArray", {"1.5", "[true]", R"(["1"])"}},
        Refused{10, "Int32Array", {"5", "[1,2.0]", "[1,2147483648]", "[true]"}},
        Refused{11, "Int64Array", {"5", "[9223372036854775808]"}},
        Refused{12, "StringArray", {"\"a\"", "[1]"}},
        Refused{13, "UInt32Array", {"1", "[0,-1]", "[4294967296]"}},
        Refused{14, "UInt64Array", {"1", "[1,-1]", "[0.5]"}}));

TEST_F(SetPropertyTest, TheSchemaRefusesAnEmptyArrayAndMixedElements) {
    const std::string wrongForm =
        R"(-32602 [{"type":"usage","usage":"kUsageTypeParameter","value":"#/params/value",)"
        R"("value_type":"string"},{"type":"usage","usage":"kUsageTypeDetails",)"
        R"("value":"Wrong data type for parameter property. The data type must be one of the )"
        R"(following data types: boolean, string, number, array of boolean, array of string, or )"
        R"(array of number.","value_type":"string"}])";
    for (const char* value : {"[]", R"([1,"a"])", "[1,true]", "null", "{}", "[[1]]"}) {
        EXPECT_EQ(set(10, value), wrongForm) << value;
    }
    EXPECT_EQ(driver.takeCalls(), Calls{});
}

// ---- The sequence of calls
// -----------------------------------------------------------------------

TEST_F(SetPropertyTest, CallsTheDriverInThisOrder) {
    giveDataType(2);
    EXPECT_EQ(ask("setProperty", R"("property":"Session.Timeout","value":1.5)"),
              R"({"data_type":"Double"})");
    EXPECT_EQ(driver.takeCalls(),
              (Calls{"getSystemPropertyStringArray(7, \"Sys.SessionProperties\")",
                     "freeStringArray(4)", "openDriverDefinedProperty(7, \"Session.Timeout\")",
                     "getPropertyPropertyInt32(21, \"Prop.DataType\")",
                     "setSessionPropertyDouble(7, \"Session.Timeout\", 1.5)",
                     "translateStaticEnumValueToString(\"DataType\", 2)", "closeProperty(21)"}));
}

TEST_F(SetPropertyTest, TheTypeIsCheckedBeforeTheDriverWrites) {
    giveDataType(5);
    EXPECT_EQ(ask("setProperty", R"("property":"Sys.Delay","value":1)"), wrongType("String"));
    EXPECT_EQ(ask("setProperty", R"("property":"Sys.Delay","value":"a")"),
              internalError("Unsupported property category."));
}

TEST_F(SetPropertyTest, ASystemListCannotBeWritten) {
    giveDataType(12);
    EXPECT_EQ(ask("setProperty", R"("property":"Sys.Devices","value":["a"])"),
              internalError("Unsupported property category."));
}

TEST_F(SetPropertyTest, ASessionPropertyOfTypeStringIsWrittenThroughTheFunctionForResources) {
    giveDataType(5);
    EXPECT_EQ(ask("setProperty", R"("property":"Session.Name","devices":"Mod1","value":"n")"),
              R"({"data_type":"String"})");
    EXPECT_EQ(write(), "setGenericPropertyString(7, \"Mod1\", \"Session.Name\", \"n\")");
}

TEST_F(SetPropertyTest, AScalarOnTwoDevicesNeedsOneElementForEach) {
    giveDataType(3);
    EXPECT_EQ(ask("setProperty", R"("property":"Dev.Own","devices":"Mod1,Mod2","value":[5,6])"),
              R"({"data_type":"Int32Array"})");
    EXPECT_EQ(write(), "setGenericPropertyInt32Array(7, \"Mod1,Mod2\", \"Dev.Own\", [5,6])");
    EXPECT_EQ(ask("setProperty", R"("property":"Dev.Own","devices":"Mod1,Mod2","value":5)"),
              wrongType("Int32Array"));
}

TEST_F(SetPropertyTest, AFailingWriteStillClosesTheProperty) {
    fail("setGenericPropertyInt32", -250999, R"({"from":"driver"})");
    fail("closeProperty", -250998);
    EXPECT_EQ(set(3, "5"), "-250999");
    EXPECT_EQ(statusText, R"({"from":"driver"})");
    EXPECT_EQ(afterOpening(driver.takeCalls()),
              (Calls{"setGenericPropertyInt32(7, \"Mod1\", \"Dev.Own\", 5)", "closeProperty(22)"}));
}

TEST_F(SetPropertyTest, AnUnknownDataTypeFailsWithoutDetails) {
    for (const int number : {0, 15, -1}) {
        EXPECT_EQ(set(number, "5"), "-250800");
    }
    EXPECT_EQ(afterOpening(driver.takeCalls()), Calls{"closeProperty(22)"});
}

TEST_F(SetPropertyTest, NvmemAreasAreNotAParameter) {
    EXPECT_EQ(
        ask("setProperty", R"("property":"NVMEM.Size","nvmem_areas":"Mod1/user","value":1)"),
        R"(-32602 [{"type":"usage","usage":"kUsageTypeParameter","value":"#/params/nvmem_areas",)"
        R"("value_type":"string"},{"type":"usage","usage":"kUsageTypeDetails",)"
        R"("value":"This parameter you specified is unsupported.","value_type":"string"}])");
}

// ---- Commit -------------------------------------------------------------------------------------

TEST_F(SetPropertyTest, CommitUsesTheResourcesOrTheDefaultOnes) {
    EXPECT_EQ(ask("commitProperties", R"("physical_channels":"Mod1/ch0:1")"), "{}");
    EXPECT_EQ(driver.calls().back(), "commitPropertiesGeneric(7, \"Mod1/ch0:1\")");
    EXPECT_EQ(ask("commitProperties"), "{}");
    EXPECT_EQ(driver.calls().back(), "commitPropertiesGeneric(7, \"\")");
    openSession(R"("devices":"Mod1")");
    EXPECT_EQ(ask("commitProperties"), "{}");
    EXPECT_EQ(driver.takeCalls(), Calls{"commitPropertiesGeneric(7, \"$DefaultDevices\")"});
}

TEST_F(SetPropertyTest, CommitPassesTheDriversErrorOn) {
    fail("commitPropertiesGeneric", -250999);
    EXPECT_EQ(ask("commitProperties", R"("devices":"Mod1")"), "-250999");
}

TEST_F(SetPropertyTest, CommitAcceptsDevicesOrChannelsButNotBoth) {
    EXPECT_EQ(ask("commitProperties", R"("devices":"Mod1","physical_channels":"Mod1/ch0")"),
              R"(-32602 [{"type":"usage","usage":"kUsageTypeParameter","value":"#/params",)"
              R"("value_type":"string"},{"type":"usage","usage":"kUsageTypeDetails",)"
              R"("value":"You must specify none or only one of the following parameters: devices, )"
              R"(physical_channels.","value_type":"string"}])");
}

}  // namespace
