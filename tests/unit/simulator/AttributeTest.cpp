#include "Values.h"

using namespace drivertest;

namespace {

// An open property of Mod1 or one of its channels, closed at the end of its scope.
class Opened {
  public:
    Opened(Handle session, const char* resource, const char* property) {
        Status status;
        nQITRMCAPI100_openGenericProperty(session, resource, property, &handle, &status);
        EXPECT_EQ(status.code, 0) << status.text();
    }
    Opened(Handle session, const char* property) {
        Status status;
        nQITRMCAPI100_openDriverDefinedProperty(session, property, &handle, &status);
        EXPECT_EQ(status.code, 0) << status.text();
    }
    Opened(const Opened&) = delete;
    Opened& operator=(const Opened&) = delete;
    ~Opened() {
        Status status;
        nQITRMCAPI100_closeProperty(handle, &status);
    }

    std::string text(const char* attribute) const {
        Status status;
        char* given = nullptr;
        nQITRMCAPI100_getPropertyPropertyString(handle, attribute, &given, &status);
        EXPECT_EQ(status.code, 0) << status.text();
        const std::string copy = given != nullptr ? given : "(null)";
        nQITRMCAPI100_freeString(given);
        return copy;
    }
    std::int32_t number(const char* attribute) const {
        Status status;
        std::int32_t value = -99;
        nQITRMCAPI100_getPropertyPropertyInt32(handle, attribute, &value, &status);
        EXPECT_EQ(status.code, 0) << status.text();
        return value;
    }
    bool flag(const char* attribute) const {
        Status status;
        std::uint8_t value = 99;
        nQITRMCAPI100_getPropertyPropertyBool(handle, attribute, &value, &status);
        EXPECT_EQ(status.code, 0) << status.text();
        return value != 0;
    }

    nQITRMCAPI100_Property handle = 0;
};

using AttributeTest = BenchTest;

TEST_F(AttributeTest, APropertyOfAModuleHasItsAttributes) {
    const Opened range(session, "Mod1", "DMM.Range");
    EXPECT_EQ(range.number("Prop.DataType"), 2);
    EXPECT_EQ(range.number("Prop.Access"), 3);
    EXPECT_EQ(range.text("Prop.Descr"), "The largest value that can be measured.");
    EXPECT_EQ(range.text("Prop.Doc"), "The range applies from the next measurement on.");
    EXPECT_EQ(range.text("Prop.Unit"), "V");
    EXPECT_EQ(range.text("Prop.MinValue"), "0.1");
    EXPECT_EQ(range.text("Prop.MaxValue"), "1000");
    EXPECT_FALSE(range.flag("Prop.IsEnum"));
    EXPECT_FALSE(range.flag("Prop.PendingChanges"));
}

TEST_F(AttributeTest, MissingTextsAreEmpty) {
    const Opened slot(session, "Dev.SlotNum");
    EXPECT_EQ(slot.number("Prop.DataType"), 6);
    EXPECT_EQ(slot.number("Prop.Access"), 1);
    EXPECT_EQ(slot.text("Prop.Doc"), "");
    EXPECT_EQ(slot.text("Prop.Unit"), "");
    EXPECT_EQ(slot.text("Prop.MinValue"), "");
    EXPECT_EQ(slot.text("Prop.MaxValue"), "");
}

TEST_F(AttributeTest, DataTypesHaveTheirNumbers) {
    const std::vector<std::pair<const char*, std::int32_t>> types{
        {"DMM.AutoRange", 1},    {"DMM.Range", 2},       {"DMM.Offset", 3},
        {"DMM.TriggerDelay", 4}, {"DMM.Note", 5},        {"DMM.SampleCount", 6},
        {"DMM.TriggerCount", 7}, {"DMM.InputsInUse", 8}, {"DMM.Readings", 9},
        {"DMM.Trims", 10},       {"DMM.Timestamps", 11}, {"DMM.Labels", 12},
        {"DMM.Histogram", 13},   {"DMM.Totals", 14}};
    for (const auto& [name, number] : types) {
        EXPECT_EQ(Opened(session, "Mod1", name).number("Prop.DataType"), number) << name;
    }
}

TEST_F(AttributeTest, AnEnumerationIsListedInItsOrder) {
    const Opened function(session, "Mod1", "DMM.Function");
    EXPECT_TRUE(function.flag("Prop.IsEnum"));
    EXPECT_EQ(function.text("Prop.Enum.Name"), "MeasurementFunction");
    Status status;
    std::int32_t* numbers = nullptr;
    std::uint32_t count = 0;
    nQITRMCAPI100_getPropertyPropertyInt32Array(function.handle, "Prop.Enum.Values", &numbers,
                                                &count, &status);
    EXPECT_EQ(std::vector<std::int32_t>(numbers, numbers + count),
              (std::vector<std::int32_t>{0, 1, 2, 10}));
    nQITRMCAPI100_freeArray(numbers);
    char** names = nullptr;
    nQITRMCAPI100_getPropertyPropertyStringArray(function.handle, "Prop.Enum.ValueNames", &names,
                                                 &count, &status);
    EXPECT_EQ(takeNames(names, count), (Names{"Voltage", "Current", "Resistance", "Temperature"}));
    EXPECT_EQ(status.code, 0) << status.text();
}

TEST_F(AttributeTest, ChangesArePendingUntilTheCommit) {
    const Opened limit(session, "Mod2/ch0", "PSU.CurrentLimit");
    const Opened other(session, "Mod2/ch1", "PSU.CurrentLimit");
    EXPECT_EQ(set(setDouble, session, "Mod2/ch0", "PSU.CurrentLimit", 1.0).code, 0);
    EXPECT_TRUE(limit.flag("Prop.PendingChanges"));
    EXPECT_FALSE(other.flag("Prop.PendingChanges"));
    Status status;
    nQITRMCAPI100_commitPropertiesGeneric(session, "Mod2", &status);
    EXPECT_FALSE(limit.flag("Prop.PendingChanges"));
}

TEST_F(AttributeTest, AnUnknownAttributeIsRefused) {
    const Opened range(session, "Mod1", "DMM.Range");
    Status unknown;
    char* text = nullptr;
    nQITRMCAPI100_getPropertyPropertyString(range.handle, "Prop.Colour", &text, &unknown);
    EXPECT_EQ(unknown.code, -250974);
    EXPECT_EQ(unknown.text(),
              detailsOf("unknownAttribute", usage("AttributeName", "\"Prop.Colour\"")));
    Status type;
    nQITRMCAPI100_getPropertyPropertyString(range.handle, "Prop.DataType", &text, &type);
    EXPECT_EQ(type.code, -250974);
    Status notEnumerated;
    nQITRMCAPI100_getPropertyPropertyString(range.handle, "Prop.Enum.Name", &text, &notEnumerated);
    EXPECT_EQ(notEnumerated.code, -250974);
    EXPECT_EQ(text, nullptr);
}

TEST_F(AttributeTest, UnknownPropertiesCannotBeOpened) {
    Status unknown;
    nQITRMCAPI100_Property handle = 5;
    nQITRMCAPI100_openDriverDefinedProperty(session, "DMM.Range", &handle, &unknown);
    EXPECT_EQ(unknown.code, -250964);
    EXPECT_EQ(handle, 0u);
    Status wrongPlace;
    nQITRMCAPI100_openGenericProperty(session, "Mod2", "DMM.Range", &handle, &wrongPlace);
    EXPECT_EQ(wrongPlace.code, -250964);
    Status none;
    nQITRMCAPI100_openGenericProperty(session, "", "DMM.Range", &handle, &none);
    EXPECT_EQ(none.code, -250959);
}

TEST_F(AttributeTest, AClosedHandleIsRefused) {
    Status status;
    nQITRMCAPI100_Property handle = 0;
    nQITRMCAPI100_openGenericProperty(session, "Mod1", "DMM.Range", &handle, &status);
    nQITRMCAPI100_closeProperty(handle, &status);
    EXPECT_EQ(status.code, 0);
    Status twice;
    nQITRMCAPI100_closeProperty(handle, &twice);
    EXPECT_EQ(twice.code, -250973);
    Status read;
    std::int32_t value = 0;
    nQITRMCAPI100_getPropertyPropertyInt32(handle, "Prop.DataType", &value, &read);
    EXPECT_EQ(read.code, -250973);
}

TEST_F(AttributeTest, ClosingTheSessionClosesItsProperties) {
    Session other;
    Status status;
    nQITRMCAPI100_Property handle = 0;
    nQITRMCAPI100_openDriverDefinedProperty(other, "Sys.Devices", &handle, &status);
    other.close();
    nQITRMCAPI100_closeProperty(handle, &status);
    EXPECT_EQ(status.code, -250973);
}

TEST_F(AttributeTest, EnumerationsOfTheDriverTranslateBothWays) {
    EXPECT_EQ(nQITRMCAPI100_translateStaticEnumStringToValue("ReservationAccess", "ReadOnly"), 1);
    EXPECT_EQ(nQITRMCAPI100_translateStaticEnumStringToValue("ReservationAccess", "ReadWrite"), 3);
    EXPECT_EQ(nQITRMCAPI100_translateStaticEnumStringToValue("ReservationAccess", "readwrite"), 0);
    EXPECT_EQ(nQITRMCAPI100_translateStaticEnumStringToValue("Nothing", "ReadOnly"), 0);
    EXPECT_EQ(nQITRMCAPI100_translateStaticEnumStringToValue(nullptr, nullptr), 0);
    EXPECT_STREQ(nQITRMCAPI100_translateStaticEnumValueToString("PropertyAccess", 2), "WriteOnly");
    EXPECT_STREQ(nQITRMCAPI100_translateStaticEnumValueToString("PropertyAccess", 4), "");
    EXPECT_STREQ(nQITRMCAPI100_translateStaticEnumValueToString(nullptr, 1), "");
    const char* const types[] = {"Bool",        "Double",     "Int32",      "Int64",
                                 "String",      "UInt32",     "UInt64",     "BoolArray",
                                 "DoubleArray", "Int32Array", "Int64Array", "StringArray",
                                 "UInt32Array", "UInt64Array"};
    for (std::int32_t number = 1; number <= 14; ++number) {
        EXPECT_STREQ(nQITRMCAPI100_translateStaticEnumValueToString("DataType", number),
                     types[number - 1]);
        EXPECT_EQ(nQITRMCAPI100_translateStaticEnumStringToValue("DataType", types[number - 1]),
                  number);
    }
    EXPECT_STREQ(nQITRMCAPI100_translateStaticEnumValueToString("DataType", 15), "");
}

}  // namespace
