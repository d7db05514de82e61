#include "ChassisProbe.h"

using namespace drivertest;

namespace {

constexpr const char* properties =
    ",\"properties\":{\"P\":{\"type\":\"Int32\",\"max\":9,\"value\":1},"
    "\"T\":{\"type\":\"String\",\"value\":\"\"}}";

void expectCommandFault(const std::string& members, const std::string& place,
                        const std::string& words) {
    expectFault(device(properties + std::string(",\"commands\":{\"C\":{") + members + "}}"),
                "/devices/0/commands/C" + place, words);
}

void expectFailureFault(const std::string& members, const std::string& place,
                        const std::string& words) {
    expectCommandFault("\"fails\":{" + members + "}", "/fails" + place, words);
}

void expectStatusFault(const std::string& members, const std::string& place,
                       const std::string& words) {
    expectFailureFault("\"status\":{" + members + "}", "/status" + place, words);
}

void expectEntryFault(const std::string& members, const std::string& place,
                      const std::string& words) {
    expectStatusFault("\"code\":-1,\"details\":[{" + members + "}]", "/details/0" + place, words);
}

TEST(BrokenCommandTest, EffectsOnTheDeviceAreThoseOfItsProperties) {
    expectFault(
        device(properties + std::string(",\"channels\":{\"prefix\":\"ch\",\"count\":1,\"commands\":"
                                        "{\"C\":{\"on_device\":{\"sets\":{\"Q\":1}}}}}")),
        "/devices/0/channels/commands/C/on_device/sets/Q",
        "is not a stored property of the device; "
        "on_device changes properties of the device that the resource belongs to");
    expectCommandFault("\"on_device\":{\"adds\":{\"T\":1}}", "/on_device/adds/T",
                       "cannot be added to; only single numbers can");
    expectCommandFault(
        "\"on_device\":{\"resets\":true}", "/on_device/resets",
        "is not a known member; perhaps \"sets\" is meant; the members here are sets, adds");
}

TEST(BrokenCommandTest, AFailureHasAStatus) {
    expectFailureFault("", "/status", "is missing; must be the status that the command gives");
    expectFailureFault("\"often\":1", "/often",
                       "is not a known member; the members here are status, when, every, "
                       "probability");
}

TEST(BrokenCommandTest, AFailureDependsOnAPropertyOfItsResource) {
    const std::string status = "\"status\":{\"code\":-1},";
    expectFailureFault(status + "\"when\":{\"property\":\"Q\",\"is\":1}", "/when/property",
                       "is not a stored property of the resource; "
                       "a command looks at properties of its own resource");
    expectFailureFault(status + "\"when\":{\"property\":\"P\"}", "/when/is",
                       "is missing; must be the value at which the command fails");
    expectFailureFault(status + "\"when\":{\"property\":\"P\",\"is\":10}", "/when/is",
                       "is 10; must be within the limits of the property, up to 9");
    expectFailureFault(status + "\"when\":{\"is\":1}", "/when/property",
                       "is missing; must be the name of a property of the resource");
}

TEST(BrokenCommandTest, AProbabilityIsBetweenZeroAndOne) {
    const std::pair<const char*, std::string> numbers[] = {
        {"-0.01", "-0.01"}, {"1.01", "1.01"}, {"\"1\"", "the text \"1\""}, {"true", "true"}};
    for (const auto& [number, shown] : numbers) {
        expectFailureFault("\"status\":{\"code\":-1},\"probability\":" + std::string(number),
                           "/probability", "is " + shown + "; must be a number from 0 to 1");
    }
}

TEST(BrokenCommandTest, ExecutionsAreCountedFromOne) {
    const std::string right = "; must be a whole number from 1 to 4294967295";
    for (const std::string number : {"0", "-1", "1.5", "4294967296"}) {
        expectFailureFault("\"status\":{\"code\":-1},\"every\":" + number, "/every",
                           "is " + number + right);
    }
}

TEST(BrokenCommandTest, AStatusHasACodeOtherThanSuccess) {
    expectStatusFault("", "/code", "is missing; must be the number of the status");
    expectStatusFault("\"code\":0", "/code",
                      "is 0; "
                      "must be a number other than 0, which means success");
    expectStatusFault("\"code\":2147483648", "/code",
                      "is 2147483648; must be a whole number of 32 bits");
    expectStatusFault("\"json\":\"{}\"", "/code", "is missing; must be the number of the status");
}

TEST(BrokenCommandTest, AStatusHasEitherDetailsOrATextOfItsOwn) {
    expectStatusFault("\"code\":-1,\"json\":\"{}\",\"details\":[]", "/details",
                      "is not a known member; the members here are code, json");
    expectStatusFault("\"code\":-1,\"json\":{}", "/json", "is an object; must be a text");
    expectStatusFault("\"code\":-1,\"json\":\"a\\u0000\"", "/json",
                      "holds a NUL character; texts must not hold one");
    expectStatusFault("\"code\":-1,\"causes\":[{\"code\":-2,\"json\":\"{}\"}]", "/causes/0/json",
                      "is not a known member; "
                      "the members here are code, constant, details, causes");
}

TEST(BrokenCommandTest, AnEntryOfTheDetailsIsOfOneKind) {
    expectEntryFault("", "/empty",
                     "is missing; must be there, unless usage, elaboration or header is");
    expectEntryFault("\"usage\":\"kU\"", "/value",
                     "is missing; must be a text, a number or an array of texts");
    expectEntryFault("\"usage\":\"\",\"value\":1", "/usage",
                     "is empty; must be the key of a label or phrase");
    expectEntryFault("\"usage\":\"kU\",\"value\":-1", "/value",
                     "is -1; must be a text, a whole number of 32 bits that "
                     "is not below 0, or an array of texts");
    expectEntryFault("\"usage\":\"kU\",\"value\":[\"a\",1]", "/value/1", "is 1; must be a text");
    expectEntryFault("\"header\":\"kA\",\"value\":1", "/value",
                     "is not a known member; the members here are header");
    expectEntryFault("\"elaboration\":\"kA\",\"header\":\"kA\"", "/header",
                     "is not a known member; the members here are elaboration");
    expectEntryFault("\"empty\":false", "/empty", "is false; must be true");
}

TEST(BrokenCommandTest, AnItemBelongsToAnEnumerationOfTheChassis) {
    expectEntryFault("\"usage\":\"kU\",\"item\":1", "/enum",
                     "is missing; must be the name of an enumeration");
    expectEntryFault("\"usage\":\"kU\",\"enum\":\"E\"", "/item",
                     "is missing; must be the number of an item");
    expectEntryFault("\"usage\":\"kU\",\"item\":1,\"enum\":\"E\"", "/enum",
                     "is not a known enumeration; must be a member of /enums of the chassis");
    expectEntryFault("\"usage\":\"kU\",\"item\":1,\"value\":1", "/value",
                     "is not a known member; the members here are usage, item, enum");
}

std::string nested(int depth) {
    return "\"code\":-1" +
           (depth > 0 ? ",\"causes\":[{" + nested(depth - 1) + "}]" : std::string());
}

TEST(BrokenCommandTest, CausesAreNestedSixteenDeep) {
    const ChassisFile file(
        device(",\"commands\":{\"C\":{\"fails\":{\"status\":{" + nested(16) + "}}}}"));
    EXPECT_EQ(openWith(file.path).output, "0\n\n1 2 3\n");
    std::string place;
    for (int i = 0; i < 17; ++i) {
        place += "/causes/0";
    }
    expectStatusFault(nested(17), place, "is nested too deep; causes are nested at most 16 deep");
}

}  // namespace
