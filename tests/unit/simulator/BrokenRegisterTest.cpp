#include "ChassisProbe.h"

using namespace drivertest;

namespace {

void expectBlockFault(const std::string& members, const std::string& place,
                      const std::string& words) {
    expectFault(device(",\"properties\":{\"D\":{\"type\":\"Double\",\"value\":1},"
                       "\"I\":{\"type\":\"Int32\",\"value\":1},"
                       "\"B\":{\"type\":\"Bool\",\"value\":true},"
                       "\"W\":{\"type\":\"Bool\",\"access\":\"WriteOnly\",\"value\":true},"
                       "\"T\":{\"type\":\"String\",\"value\":\"\"},"
                       "\"A\":{\"type\":\"Int32Array\",\"value\":[1]}},"
                       "\"commands\":{\"C\":{}},\"channels\":{\"prefix\":\"ch\",\"count\":1},"
                       "\"registers\":[{\"address\":2," +
                       members + "}]"),
                "/devices/0/registers/0" + place, words);
}

TEST(BrokenRegisterTest, UnknownMembersOfABlockAreReportedWithTheKnownOnes) {
    expectBlockFault("\"size\":4,\"show\":\"I\"", "/show",
                     "is not a known member; perhaps \"shows\" is meant; the members here are "
                     "name, description, address, size, bytes, access, "
                     "width, on_read, on_write, runs, shows");
}

TEST(BrokenRegisterTest, TheAccessIsOneOfThree) {
    expectBlockFault("\"size\":4,\"access\":\"None\"", "/access",
                     "is the text \"None\"; must be ReadOnly, WriteOnly or ReadWrite");
}

TEST(BrokenRegisterTest, AWidthIsThatOfARegister) {
    expectBlockFault("\"size\":4,\"width\":24", "/width", "is 24; must be 8, 16, 32 or 64");
    expectBlockFault("\"size\":4,\"width\":1", "/width",
                     "is 1; must be a whole number from 8 to 64");
    const std::string divides =
        "does not divide the block; address and size must be multiples of the width in bytes";
    expectBlockFault("\"size\":4,\"width\":32", "/width", divides);
    expectBlockFault("\"size\":3,\"width\":16", "/width", divides);
}

TEST(BrokenRegisterTest, SideEffectsHaveOneOfTheKnownNames) {
    expectBlockFault("\"size\":4,\"on_read\":\"ones_clear\"", "/on_read",
                     "is the text \"ones_clear\"; must be clear");
    expectBlockFault("\"size\":4,\"on_write\":\"clear\"", "/on_write",
                     "is the text \"clear\"; must be ones_clear");
    expectBlockFault("\"size\":4,\"on_read\":true", "/on_read", "is true; must be a text");
}

TEST(BrokenRegisterTest, SideEffectsThatCannotHappenAreRefused) {
    expectBlockFault("\"size\":4,\"access\":\"WriteOnly\",\"on_read\":\"clear\"", "/on_read",
                     "never happens; the registers cannot be read");
    expectBlockFault("\"size\":4,\"access\":\"ReadOnly\",\"on_write\":\"ones_clear\"", "/on_write",
                     "never happens; the registers cannot be written");
    expectBlockFault("\"size\":4,\"access\":\"ReadOnly\",\"runs\":\"C\"", "/runs",
                     "never happens; the registers cannot be written");
}

TEST(BrokenRegisterTest, ACommandOfARegisterMustBelongToTheDevice) {
    expectBlockFault("\"size\":4,\"runs\":\"Other\"", "/runs",
                     "is not a command of the device; a write carries out such a command");
}

TEST(BrokenRegisterTest, AShownPropertyMustExist) {
    expectBlockFault("\"size\":4,\"shows\":\"Other\"", "/shows",
                     "is not a stored property of the resource; "
                     "a register shows a property that is there");
    expectBlockFault("\"size\":4,\"shows\":\"Dev.SlotNum\"", "/shows",
                     "is not a stored property of the resource; "
                     "a register shows a property that is there");
    expectBlockFault("\"size\":4,\"shows\":{\"property\":\"I\",\"resource\":\"ch0\"}",
                     "/shows/property",
                     "is not a stored property of the resource; "
                     "a register shows a property that is there");
    expectBlockFault("\"size\":4,\"shows\":{\"property\":\"I\",\"resource\":\"ch1\"}",
                     "/shows/resource",
                     "is not a part of the device; must be a channel or an area, like ch0");
    expectBlockFault("\"size\":4,\"shows\":{}", "/shows/property",
                     "is missing; must be the name of the property");
    expectBlockFault("\"size\":4,\"shows\":[]", "/shows",
                     "is an array; "
                     "must be a text, or an object with property and resource");
}

TEST(BrokenRegisterTest, AShownPropertyMustBeOneNumberOfTheRightSize) {
    expectBlockFault("\"size\":4,\"shows\":\"T\"", "/shows",
                     "cannot be shown; only single numbers and Booleans can");
    expectBlockFault("\"size\":4,\"shows\":\"A\"", "/shows",
                     "cannot be shown; only single numbers and Booleans can");
    const std::string wrong = "does not have the size of the registers; its size can be ";
    expectBlockFault("\"size\":2,\"shows\":\"D\"", "/shows", wrong + "4 or 8 bytes");
    expectBlockFault("\"size\":8,\"shows\":\"I\"", "/shows", wrong + "1, 2 or 4 bytes");
    expectBlockFault("\"size\":3,\"shows\":\"B\"", "/shows", wrong + "1, 2, 4 or 8 bytes");
    expectBlockFault("\"size\":1,\"shows\":\"W\"", "/shows",
                     "can only be written; the access of the registers must be WriteOnly");
}

TEST(BrokenRegisterTest, ABlockShowsOnlyOneProperty) {
    const std::string words = "contradicts shows; registers that show a property do nothing else";
    for (const std::string member : {"\"bytes\":\"00\"", "\"on_read\":\"clear\"",
                                     "\"on_write\":\"ones_clear\"", "\"runs\":\"C\""}) {
        expectBlockFault("\"size\":4,\"shows\":\"I\"," + member,
                         "/" + member.substr(1, member.find('"', 1) - 1), words);
    }
}

TEST(BrokenRegisterTest, BlocksMayBeInAnyOrderButMustNotOverlap) {
    const std::string far =
        ",\"registers\":[{\"address\":64,\"size\":8},{\"address\":0,\"size\":8},"
        "{\"address\":8,\"size\":8}";
    const ChassisFile file(device(far + "]"));
    EXPECT_EQ(openWith(file.path).output, "0\n\n1 2 3\n");
    const std::pair<const char*, const char*> blocks[] = {
        {"{\"address\":4,\"size\":1}", "4 to 4"},
        {"{\"address\":16,\"size\":49}", "16 to 64"},
        {"{\"address\":71,\"size\":1}", "71 to 71"},
        {"{\"address\":15,\"size\":2}", "15 to 16"}};
    for (const auto& [block, addresses] : blocks) {
        expectFault(device(far + "," + block + "]"), "/devices/0/registers/3",
                    "has the addresses " + std::string(addresses) +
                        ", which overlap other registers or pass 4294967295; "
                        "each address may stand for one register");
    }
}

}  // namespace
