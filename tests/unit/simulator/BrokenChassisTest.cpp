#include <array>

#include "ChassisProbe.h"

using namespace drivertest;

namespace {

TEST(BrokenChassisTest, TheHighestHandleIsFollowedByOne) {
    const ChassisFile file("{\"first_session_handle\":4294967294,\"devices\":[]}");
    EXPECT_EQ(openWith(file.path).output, "0\n\n4294967294 4294967295 1\n");
}

TEST(BrokenChassisTest, AnEmptyPathMeansTheBuiltInChassis) {
    EXPECT_EQ(openWith("").output, "0\n\n1 2 3\n");
}

TEST(BrokenChassisTest, AMissingFileIsReportedOnce) {
    const Probe probe = openWith("/nonexistent/chassis.json");
    EXPECT_EQ(probe.output.substr(0, 8), "-250952\n");
    EXPECT_EQ(probe.errors,
              "qitrmcapi: /nonexistent/chassis.json: cannot be read: No such file or directory; "
              "QITRMC_SIM_CHASSIS must name a readable file\n");
}

TEST(BrokenChassisTest, AFolderIsNotAFile) {
    EXPECT_EQ(openWith("/tmp").errors,
              "qitrmcapi: /tmp: cannot be read: Is a directory; "
              "QITRMC_SIM_CHASSIS must name a readable file\n");
}

TEST(BrokenChassisTest, AnEndlessFileIsRefused) {
    EXPECT_EQ(openWith("/dev/zero").errors,
              "qitrmcapi: /dev/zero: is larger than 16 MiB; "
              "QITRMC_SIM_CHASSIS must name a readable file\n");
}

TEST(BrokenChassisTest, AnEmptyFileIsNotJson) {
    expectFault("", "",
                "is not JSON at line 1, column 1: The document is empty; "
                "a chassis description is one JSON object");
}

TEST(BrokenChassisTest, TextThatIsNotJsonIsReportedWithItsLine) {
    expectFault("{\n  \"devices\": [,]\n}", "",
                "is not JSON at line 2, column 15: Invalid value; "
                "a chassis description is one JSON object");
}

TEST(BrokenChassisTest, AnExponentOutOfRangeIsRefusedBeforeItIsRead) {
    expectFault("{\"devices\": 0.1e-2147483639}", "",
                "holds a number out of range at line 1, column 13; "
                "exponents have at most 4 digits");
}

TEST(BrokenChassisTest, ANumberTooSmallForADoubleIsRefusedInsteadOfACrash) {
    for (const std::string& number :
         {std::string("0.12345678901234567e-341"), "0." + std::string(400, '0') + "1",
          std::string("-0.00000000000000000000000000000001e-320"), std::string("9.9e-301")}) {
        const std::string column = number.front() == '-' ? "14" : "13";
        expectFault("{\"devices\": " + number + "}", "",
                    "holds a number out of range at line 1, column " + column +
                        "; numbers are 0 or have an amount from 1e-300 to 1.79e308");
    }
}

TEST(BrokenChassisTest, ABrokenFileOfFaultsIsRefusedLikeABrokenChassis) {
    const ChassisFile file("{\"faults\":[{}]}");
    const Probe probe = openWith("", "QITRMC_SIM_FAULTS='" + file.path + "'");
    const std::string words = "does nothing; must have delay, status or output";
    EXPECT_EQ(probe.output,
              "-250952\n" +
                  detailsOf("chassisNotLoaded", usage("FileName", "\"" + file.path + "\"") + "," +
                                                    usage("JsonDocPointer", "\"/faults/0\"") + "," +
                                                    usage("Details", "\"" + words + "\"")) +
                  "\n0 0 0\n");
    EXPECT_EQ(probe.errors, "qitrmcapi: " + file.path + ": /faults/0 " + words + "\n");
}

TEST(BrokenChassisTest, AFileOfFaultsMayBeMissing) {
    EXPECT_EQ(openWith("", "QITRMC_SIM_FAULTS=/nonexistent/faults.json").output, "0\n\n1 2 3\n");
    EXPECT_EQ(openWith("", "QITRMC_SIM_FAULTS=").output, "0\n\n1 2 3\n");
}

TEST(BrokenChassisTest, AMissingMemberIsNamedByItsPlace) {
    expectFault("{}", "/devices", "is missing; must be an array of devices");
    expectFault("{\"devices\":[{}]}", "/devices/0/name",
                "is missing; must be the name of the device");
}

TEST(BrokenChassisTest, AMistypedMemberIsNamedWithTheOnesThatExist) {
    expectFault("{\"devises\":[]}", "/devises",
                "is not a known member; perhaps \"devices\" is meant; the members here are "
                "$schema, devices, first_session_handle, enums, driver_properties, seed, "
                "system_values, session_values");
}

TEST(BrokenChassisTest, ARepeatedMemberIsRefused) {
    expectFault("{\"devices\":[],\"devices\":[]}", "/devices",
                "stands there twice; each member may be given once");
}

TEST(BrokenChassisTest, ARepeatedCommandIsRefused) {
    expectFault(device(",\"commands\":{\"C\":{},\"C\":{}}"), "/devices/0/commands/C",
                "stands there twice; each member may be given once");
}

TEST(BrokenChassisTest, NamesThatClientsCannotWriteAreRefused) {
    const auto named = [](const std::string& name) {
        return "{\"devices\":[{\"name\":\"" + name + "\",\"category\":1}]}";
    };
    expectFault(named("A,B"), "/devices/0/name",
                "is the text \"A,B\", which is not a name; "
                "a name must not hold a comma, a slash or a colon");
    expectFault(named(""), "/devices/0/name",
                "is the text \"\", which is not a name; a name must not be empty");
    expectFault(named("$A"), "/devices/0/name",
                "is the text \"$A\", which is not a name; names that begin with a dollar sign are "
                "reserved");
    expectFault(named(std::string(65, 'x')), "/devices/0/name",
                "is the text \"" + std::string(40, 'x') +
                    "...\", which is not a name; a name has at most 64 bytes");
}

TEST(BrokenChassisTest, ALongTextIsCutBetweenCharactersAndNotInsideOne) {
    const auto expectShown = [](const std::string& shown, const std::string& rest) {
        expectFault(
            "{\"devices\":[{\"name\":\"" + shown + rest + "\",\"category\":1}]}", "/devices/0/name",
            "is the text \"" + shown + "...\", which is not a name; a name has at most 64 bytes");
    };
    const std::string rest(30, 'y');
    // Characters of two, three and four bytes, once crossing byte 40 and once ending there.
    for (const std::string character : {"\xC3\xA9", "\xE2\x82\xAC", "\xF0\x9F\x98\x80"}) {
        for (std::size_t inside = 1; inside < character.size(); ++inside) {
            expectShown(std::string(40 - inside, 'x'), character + rest);
        }
        expectShown(std::string(40 - character.size(), 'x') + character, rest);
        expectShown(std::string(40, 'x'), character + rest);
    }
}

TEST(BrokenChassisTest, NamesThatDifferInLetterCaseAloneAreRefused) {
    expectFault("{\"devices\":[{\"name\":\"A\",\"category\":2},{\"name\":\"a\",\"category\":2}]}",
                "/devices/1/name",
                "is the text \"a\", and there is a device \"A\" already; names must differ in more "
                "than letter case");
}

TEST(BrokenChassisTest, ASlotHoldsOneModule) {
    expectFault(device(",\"modules\":[{\"name\":\"B\",\"category\":2,\"slot\":1},"
                       "{\"name\":\"C\",\"category\":2,\"slot\":1}]"),
                "/devices/0/modules/1/slot",
                "is the slot of \"B\" already; slots hold one module each");
}

TEST(BrokenChassisTest, ModulesHaveNoModules) {
    expectFault(device(",\"modules\":[{\"name\":\"B\",\"category\":1,\"slot\":1,\"modules\":[]}]"),
                "/devices/0/modules/0/modules",
                "belongs to a device that is no chassis; "
                "only a device of category 1 outside of a slot has modules");
}

TEST(BrokenChassisTest, AnAreaMustNotHaveTheNameOfAChannel) {
    expectFault(
        device(",\"channels\":{\"prefix\":\"ch\",\"count\":2},"
               "\"nvmem_areas\":[{\"name\":\"CH1\"}]"),
        "/devices/0/nvmem_areas/0/name",
        "is the text \"CH1\", and the device has a channel or an area of this name already; "
        "names must differ in more than letter case");
}

TEST(BrokenChassisTest, APartThatARangeCannotNameIsRefused) {
    expectFault(
        device(",\"nvmem_areas\":[{\"name\":\"cal01\"}]"), "/devices/0/nvmem_areas/0/name",
        "is the text \"cal01\", which is not a name; the number at its end must not begin with 0, "
        "or a range could not name it");
}

TEST(BrokenChassisTest, DeepNestingIsReadSafely) {
    const std::string deep(200000, '[');
    const ChassisFile file("{\"devices\":" + deep + std::string(200000, ']') + "}");
    EXPECT_EQ(openWith(file.path).output.substr(0, 8), "-250952\n");
}

void expectPropertyFault(const std::string& members, const std::string& place,
                         const std::string& words) {
    expectFault(device(",\"properties\":{\"P\":{" + members + "}}"),
                "/devices/0/properties/P" + place, words);
}

TEST(BrokenChassisTest, InconsistentPropertiesAreRefused) {
    expectPropertyFault("\"type\":\"Float\"", "/type",
                        "is the text \"Float\"; must be Bool, Double, Int32, Int64, String, "
                        "UInt32 or UInt64, or one of these with Array behind it");
    expectPropertyFault("\"type\":\"Bool\"", "", "has no value; must give a value");
    expectPropertyFault("\"type\":\"UInt32\",\"value\":-1", "/value",
                        "is -1; "
                        "must be a whole number from 0 to 4294967295");
    expectPropertyFault("\"type\":\"Int32\",\"max\":4,\"value\":5", "/value",
                        "is 5; must be within the limits of the property, up to 4");
    expectPropertyFault("\"type\":\"String\",\"min\":1,\"value\":\"\"", "/min",
                        "limits what is no number; only numbers have limits");
    expectPropertyFault(
        "\"type\":\"Int32\",\"enum\":\"E\",\"value\":5", "/enum",
        "is the text \"E\", which is not a known enumeration; must be a member of /enums");
    expectPropertyFault("\"type\":\"BoolArray\",\"value\":[true,1]", "/value/1",
                        "is 1; must be true or false");
    expectPropertyFault("\"type\":\"Bool\",\"access\":\"None\",\"value\":true", "/access",
                        "is the text \"None\"; "
                        "must be ReadOnly, WriteOnly or ReadWrite");
    expectPropertyFault("\"type\":\"Bool\",\"computed\":true,\"value\":true", "/computed",
                        "is for built-in properties alone; must be left out");
    expectPropertyFault("\"type\":\"String\",\"value\":\"a\\u0000b\"", "/value",
                        "holds a NUL character; texts must not hold one");
}

TEST(BrokenChassisTest, AnItemThatTheEnumerationLacksIsRefused) {
    expectFault(
        "{\"enums\":{\"E\":{\"On\":1}},\"devices\":[{\"name\":\"A\",\"category\":2,"
        "\"properties\":{\"P\":{\"type\":\"Int32\",\"enum\":\"E\",\"value\":\"Off\"}}}]}",
        "/devices/0/properties/P/value",
        "is the text \"Off\", no item of the enumeration E; the items are On (1)");
    expectFault(
        "{\"enums\":{\"E\":{\"On\":1}},\"devices\":[{\"name\":\"A\",\"category\":2,"
        "\"properties\":{\"P\":{\"type\":\"Int32\",\"enum\":\"E\",\"value\":2}}}]}",
        "/devices/0/properties/P/value",
        "is 2, no item of the enumeration E; the items are On (1)");
}

TEST(BrokenChassisTest, DriverPropertiesKeepTheirMeaning) {
    expectFault(device(",\"properties\":{\"Dev.Name\":{\"type\":\"Bool\",\"value\":true}}"),
                "/devices/0/properties/Dev.Name",
                "is no name for a property of its own; "
                "must not be a property that the driver defines itself");
    expectFault(device(",\"values\":{\"Dev.Name\":\"B\"}"), "/devices/0/values/Dev.Name",
                "is not a property whose value can be given; "
                "must be a stored property that the driver defines for this kind");
    expectFault(
        "{\"driver_properties\":{\"device\":{\"Dev.Name\":{\"type\":\"Bool\"}}},"
        "\"devices\":[]}",
        "/driver_properties/device/Dev.Name", "is defined already; each property is defined once");
    expectFault(
        "{\"driver_properties\":{\"system\":{\"Sys.A\":{\"type\":\"Bool\","
        "\"needs_commit\":true}}},\"devices\":[]}",
        "/driver_properties/system/Sys.A",
        "can never be committed; only properties of resources are committed");
    expectFault(
        "{\"driver_properties\":{\"session\":{\"Session.A\":{\"type\":\"Bool\","
        "\"lasting\":true}}},\"devices\":[]}",
        "/driver_properties/session/Session.A",
        "can never last; sessions end, and their properties with them");
}

TEST(BrokenChassisTest, CommandsActOnExistingProperties) {
    expectFault(device(",\"commands\":{\"C\":{\"sets\":{\"P\":1}}}"),
                "/devices/0/commands/C/sets/P",
                "is not a stored property of the resource; "
                "a command changes properties of its own resource");
    expectFault(device(",\"commands\":{\"C\":{\"adds\":{\"Dev.Comment\":1}}}"),
                "/devices/0/commands/C/adds/Dev.Comment",
                "cannot be added to; only single numbers can");
    expectFault(device(",\"commands\":{\"C\":{\"seconds\":-1}}"), "/devices/0/commands/C/seconds",
                "is -1; must be a time in seconds, from 0 to a day");
}

TEST(BrokenChassisTest, RegistersDoNotOverlap) {
    expectFault(device(",\"registers\":[{\"address\":0,\"size\":8},"
                       "{\"address\":7,\"size\":1}]"),
                "/devices/0/registers/1",
                "has the addresses 7 to 7, which overlap other registers or pass 4294967295; "
                "each address may stand for one register");
    expectFault(device(",\"registers\":[{\"address\":4294967295,\"size\":2}]"),
                "/devices/0/registers/0",
                "has the addresses 4294967295 to 4294967296, which overlap other registers or pass "
                "4294967295; "
                "each address may stand for one register");
}

TEST(BrokenChassisTest, BytesAreGivenInHexadecimalDigits) {
    const auto block = [](const std::string& bytes) {
        return device(",\"registers\":[{\"address\":0,\"size\":2,\"bytes\":\"" + bytes + "\"}]");
    };
    const std::string place = "/devices/0/registers/0/bytes";
    expectFault(block("0g"), place,
                "is the text \"0g\"; must be hexadecimal digits without blanks or 0x");
    expectFault(block("000"), place,
                "has 3 digits; must be two digits for each byte, at most 4 for this size");
    expectFault(block("000000"), place,
                "has 6 digits; must be two digits for each byte, at most 4 for this size");
}

TEST(BrokenChassisTest, AGuardedAreaNeedsASerialNumberToCompareWith) {
    expectFault(device(",\"nvmem_areas\":[{\"name\":\"u\",\"size\":1,"
                       "\"serial_number_wanted\":true}]"),
                "/devices/0/nvmem_areas/0/serial_number_wanted",
                "asks for a serial number that is not there; "
                "the device must have a value for Dev.SerialNum");
}

}  // namespace
