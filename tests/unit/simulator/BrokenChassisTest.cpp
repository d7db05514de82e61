#include <array>

#include "ChassisFile.h"
#include "Driver.h"

using namespace drivertest;

namespace {

struct Probe {
    std::string output;
    std::string errors;
};

std::string contentOf(const std::string& path) {
    std::ifstream file(path);
    return std::string(std::istreambuf_iterator<char>(file), {});
}

// Opens a session in a new process that uses this chassis file.
Probe openWith(const std::string& path) {
    const ChassisFile output("");
    const ChassisFile errors("");
    const std::string command = "QITRMC_SIM_CHASSIS='" + path + "' " + OPEN_PROBE + " >" +
                                output.path + " 2>" + errors.path;
    EXPECT_EQ(std::system(command.c_str()), 0) << contentOf(errors.path);
    return {contentOf(output.path), contentOf(errors.path)};
}

void expectFault(const std::string& text, const std::string& pointer, const std::string& words) {
    const ChassisFile file(text);
    const Probe probe = openWith(file.path);
    EXPECT_EQ(probe.output,
              "-250952\n" +
                  detailsOf("chassisNotLoaded", usage("FileName", "\"" + file.path + "\"") + "," +
                                                    usage("JsonPointer", "\"" + pointer + "\"") +
                                                    "," + usage("Details", "\"" + words + "\"")) +
                  "\n0 0 0\n");
    EXPECT_EQ(probe.errors, "qitrmcapi: " + file.path + ": " + pointer +
                                (pointer.empty() ? "" : " ") + words + "\n");
}

std::string device(const std::string& members) {
    return "{\"devices\":[{\"name\":\"A\",\"category\":1" + members + "}]}";
}

TEST(BrokenChassisTest, TheHighestHandleIsFollowedByOne) {
    const ChassisFile file("{\"first_session_handle\":4294967294,\"devices\":[]}");
    EXPECT_EQ(openWith(file.path).output, "0\n\n4294967294 4294967295 1\n");
}

TEST(BrokenChassisTest, AnEmptyPathMeansTheBuiltInChassis) {
    EXPECT_EQ(openWith("").output, "0\n\n1 2 3\n");
}

TEST(BrokenChassisTest, AMissingFileIsToldOnce) {
    const Probe probe = openWith("/nonexistent/chassis.json");
    EXPECT_EQ(probe.output.substr(0, 8), "-250952\n");
    EXPECT_EQ(probe.errors,
              "qitrmcapi: /nonexistent/chassis.json: cannot be read: No such file or directory; "
              "QITRMC_SIM_CHASSIS must name a readable file\n");
}

TEST(BrokenChassisTest, TextThatIsNotJsonIsToldWithItsLine) {
    expectFault("{\n  \"devices\": [,]\n}", "",
                "is not JSON at line 2, column 15: Invalid value.; "
                "a chassis description is one JSON object");
}

TEST(BrokenChassisTest, AnExponentOutOfRangeIsRefusedBeforeItIsRead) {
    expectFault("{\"devices\": 0.1e-2147483639}", "",
                "holds a number out of range at line 1, column 16; "
                "exponents have at most 4 digits");
}

TEST(BrokenChassisTest, AMissingMemberIsNamedByItsPlace) {
    expectFault("{}", "/devices", "is missing; must be an array of devices");
    expectFault("{\"devices\":[{}]}", "/devices/0/name",
                "is missing; must be the name of the device");
}

TEST(BrokenChassisTest, AMistypedMemberIsNamedWithTheOnesThatExist) {
    expectFault("{\"devises\":[]}", "/devises",
                "is not a known member; the members here are first_session_handle, enums, "
                "driver_properties, system_values, session_values, devices");
}

TEST(BrokenChassisTest, AMemberThatStandsTwiceIsRefused) {
    expectFault("{\"devices\":[],\"devices\":[]}", "/devices",
                "stands there twice; each member may be given once");
}

TEST(BrokenChassisTest, NamesThatClientsCannotWriteAreRefused) {
    const auto named = [](const std::string& name) {
        return "{\"devices\":[{\"name\":\"" + name + "\",\"category\":1}]}";
    };
    expectFault(named("A,B"), "/devices/0/name",
                "is not a name; a name must not hold a comma, a slash or a colon");
    expectFault(named(""), "/devices/0/name", "is not a name; a name must not be empty");
    expectFault(named("$A"), "/devices/0/name",
                "is not a name; names that begin with a dollar sign are reserved");
    expectFault(named(std::string(65, 'x')), "/devices/0/name",
                "is not a name; a name has at most 64 bytes");
}

TEST(BrokenChassisTest, NamesThatDifferInLetterCaseAloneAreRefused) {
    expectFault("{\"devices\":[{\"name\":\"A\",\"category\":2},{\"name\":\"a\",\"category\":2}]}",
                "/devices/1/name",
                "is the name of two devices; names must differ in more than letter case");
}

TEST(BrokenChassisTest, ASlotHoldsOneModule) {
    expectFault(device(",\"modules\":[{\"name\":\"B\",\"category\":2,\"slot\":1},"
                       "{\"name\":\"C\",\"category\":2,\"slot\":1}]"),
                "/devices/0/modules/1",
                "stands in a slot that is taken; slots hold one module each");
}

TEST(BrokenChassisTest, ModulesHaveNoModules) {
    expectFault(device(",\"modules\":[{\"name\":\"B\",\"category\":1,\"slot\":1,\"modules\":[]}]"),
                "/devices/0/modules/0/modules",
                "belongs to a device that is no chassis; "
                "only a device of category 1 outside of a slot has modules");
}

TEST(BrokenChassisTest, AnAreaMustNotBeCalledLikeAChannel) {
    expectFault(device(",\"channels\":{\"prefix\":\"ch\",\"count\":2},"
                       "\"nvmem_areas\":[{\"name\":\"CH1\"}]"),
                "/devices/0/nvmem_areas/0/name",
                "is the name of two parts of the device; names must differ");
}

TEST(BrokenChassisTest, APartThatARangeCannotNameIsRefused) {
    expectFault(device(",\"nvmem_areas\":[{\"name\":\"cal01\"}]"), "/devices/0/nvmem_areas/0/name",
                "is not a name; the number at its end must not begin with 0, "
                "or a range could not name it");
}

TEST(BrokenChassisTest, DeepNestingIsReadWithoutHarm) {
    const std::string deep(200000, '[');
    const ChassisFile file("{\"devices\":" + deep + std::string(200000, ']') + "}");
    EXPECT_EQ(openWith(file.path).output.substr(0, 8), "-250952\n");
}

}  // namespace
