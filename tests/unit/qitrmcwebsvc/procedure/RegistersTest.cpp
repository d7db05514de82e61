#include <limits>

#include "support/ProcedureFixture.h"

namespace {

class RegistersTest : public ProcedureFixture {
  protected:
    void SetUp() override {
        ProcedureFixture::SetUp();
        openSession();
    }
};

struct Width {
    int size;
    std::uint64_t largest;
};

class RegisterWidthTest : public RegistersTest, public testing::WithParamInterface<Width> {
  protected:
    std::string size = std::to_string(GetParam().size);
    std::string largest = std::to_string(GetParam().largest);
};

TEST_P(RegisterWidthTest, IsReadWithoutSignExtension) {
    const std::string call = "readRegisterUInt" + size + "(7, \"Mod1\", 100)";
    give(call, GetParam().largest);
    EXPECT_EQ(ask("readRegister", R"("device":"Mod1","address":100,"size":)" + size),
              R"({"next_address":101,"data":)" + largest + "}");
    EXPECT_EQ(driver.takeCalls(), (Calls{"getSystemPropertyStringArray(7, \"Sys.Devices\")",
                                         "freeStringArray(4)", call}));
}

TEST_P(RegisterWidthTest, AcceptsItsLargestValue) {
    EXPECT_EQ(ask("writeRegister",
                  R"("device":"Mod1","address":100,"size":)" + size + R"(,"data":)" + largest),
              R"({"next_address":101})");
    EXPECT_EQ(driver.takeCalls(),
              (Calls{"getSystemPropertyStringArray(7, \"Sys.Devices\")", "freeStringArray(4)",
                     "writeRegisterUInt" + size + "(7, \"Mod1\", 100, " + largest + ")"}));
}

TEST_P(RegisterWidthTest, MayBeWrittenWithAFraction) {
    give("readRegisterUInt" + size, std::uint64_t{1});
    EXPECT_EQ(ask("readRegister", R"("address":0,"size":)" + size + ".0"),
              R"({"next_address":1,"data":1})");
    EXPECT_EQ(ask("readRegister", R"("address":0,"size":)" + size + "e0"),
              R"({"next_address":1,"data":1})");
    EXPECT_EQ(ask("writeRegister", R"("address":0,"data":5,"size":)" + size + ".0"),
              R"({"next_address":1})");
    EXPECT_EQ(driver.calls().back(), "writeRegisterUInt" + size + "(7, \"$DefaultDevices\", 0, 5)");
}

TEST_P(RegisterWidthTest, FailsWithTheDriversError) {
    fail("readRegisterUInt" + size, -250999);
    EXPECT_EQ(ask("readRegister", R"("address":0,"size":)" + size), "-250999");
    fail("writeRegisterUInt" + size, -250998);
    EXPECT_EQ(ask("writeRegister", R"("address":0,"data":0,"size":)" + size), "-250998");
}

INSTANTIATE_TEST_SUITE_P(Widths, RegisterWidthTest,
                         testing::Values(Width{8, 255}, Width{16, 65535}, Width{32, 4294967295},
                                         Width{64, std::numeric_limits<std::uint64_t>::max()}));

// JSON holds no integer that is too large for the widest register.
class NarrowRegisterTest : public RegisterWidthTest {};

TEST_P(NarrowRegisterTest, RefusesValuesAboveItsLargestValue) {
    const std::string tooLarge = std::to_string(GetParam().largest + 1);
    EXPECT_EQ(ask("writeRegister", R"("address":0,"size":)" + size + R"(,"data":)" + tooLarge),
              "-250860");
    EXPECT_EQ(ask("writeRegister", R"("address":0,"data":18446744073709551615,"size":)" + size),
              "-250860");
    EXPECT_EQ(driver.takeCalls(), Calls{});
}

INSTANTIATE_TEST_SUITE_P(Widths, NarrowRegisterTest,
                         testing::Values(Width{8, 255}, Width{16, 65535}, Width{32, 4294967295}));

TEST_F(RegistersTest, DataBeyondTheWidestRegisterIsRefusedByTheSchema) {
    EXPECT_EQ(
        ask("writeRegister", R"("address":0,"size":64,"data":18446744073709551616)"),
        R"(-32602 [{"type":"usage","usage":"kUsageTypeParameter","value":"#/params/data",)"
        R"("value_type":"string"},{"type":"usage","usage":"kUsageTypeDetails","value":"Wrong )"
        R"(parameter data type. The data type must be integer.","value_type":"string"}])");
    EXPECT_EQ(driver.takeCalls(), Calls{});
}

TEST_F(RegistersTest, TheNextAddressIsOneHigherAndWrapsAround) {
    give("readRegisterUInt32", std::uint64_t{9});
    EXPECT_EQ(ask("readRegister", R"("address":0,"size":32)"), R"({"next_address":1,"data":9})");
    EXPECT_EQ(ask("readRegister", R"("address":4294967295,"size":32)"),
              R"({"next_address":0,"data":9})");
    EXPECT_EQ(driver.calls().back(), "readRegisterUInt32(7, \"$DefaultDevices\", 4294967295)");
    EXPECT_EQ(ask("writeRegister", R"("address":4294967295,"size":8,"data":1)"),
              R"({"next_address":0})");
}

TEST_F(RegistersTest, OtherSizesAreRefusedByTheSchema) {
    for (const char* size : {"24", "0", "-8", "8.5", "\"8\"", "null", "128"}) {
        const std::string refused =
            R"(-32602 [{"type":"usage","usage":"kUsageTypeParameter","value":"#/params/size",)"
            R"("value_type":"string"},{"type":"usage","usage":"kUsageTypeDetails",)"
            R"("value":"Wrong enum item. The enum item must be one of the following items: )"
            R"(8, 16, 32, 64","value_type":"string"}])";
        EXPECT_EQ(ask("readRegister", R"("address":0,"size":)" + std::string(size)), refused);
        EXPECT_EQ(ask("writeRegister", R"("address":0,"data":0,"size":)" + std::string(size)),
                  refused);
    }
    EXPECT_EQ(driver.takeCalls(), Calls{});
}

TEST_F(RegistersTest, DevicesAreTheDefaultEvenInASessionOnChannels) {
    openSession(R"("physical_channels":"Mod1/ch0")");
    give("readRegisterUInt8(7, \"$DefaultDevices\", 4)", std::uint64_t{255});
    EXPECT_EQ(ask("readRegister", R"("address":4,"size":8)"), R"({"next_address":5,"data":255})");
}

}  // namespace
