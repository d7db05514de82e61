#include "Registers.h"

using namespace drivertest;

namespace {

using RegisterTest = BenchTest;

// The identification of Mod1 is the bytes 4d 4f 44 31 00 51 10 0c from address 0.
TEST_F(RegisterTest, WiderRegistersAreTheBytesOfNarrowerOnes) {
    EXPECT_EQ(read(read8, session, "Mod1", 0), std::uint8_t{0x4d});
    EXPECT_EQ(read(read8, session, "Mod1", 3), std::uint8_t{0x31});
    EXPECT_EQ(read(read16, session, "Mod1", 2), std::uint16_t{0x3144});
    EXPECT_EQ(read(read32, session, "Mod1", 0), std::uint32_t{0x31444f4d});
    EXPECT_EQ(read(read64, session, "Mod1", 0), std::uint64_t{0x0c10510031444f4d});
}

TEST_F(RegisterTest, EachWidthIsWritten) {
    EXPECT_EQ(write(write64, session, "Mod1", 256, std::uint64_t{0xfedcba9876543210}), 0);
    EXPECT_EQ(read(read64, session, "Mod1", 256), std::uint64_t{0xfedcba9876543210});
    EXPECT_EQ(read(read32, session, "Mod1", 260), std::uint32_t{0xfedcba98});
    EXPECT_EQ(write(write32, session, "Mod1", 260, std::uint32_t{0x01020304}), 0);
    EXPECT_EQ(write(write16, session, "Mod1", 258, std::uint16_t{0xabcd}), 0);
    EXPECT_EQ(write(write8, session, "Mod1", 256, std::uint8_t{0xff}), 0);
    EXPECT_EQ(read(read64, session, "Mod1", 256), std::uint64_t{0x01020304abcd32ff});
}

TEST_F(RegisterTest, DevicesHaveTheirOwnRegisters) {
    EXPECT_EQ(write(write8, session, "Mod2", 256, std::uint8_t{7}), 0);
    EXPECT_EQ(read(read8, session, "Mod1", 256), std::uint8_t{0});
}

TEST_F(RegisterTest, AnAddressWithoutARegisterIsRefused) {
    const auto answer = read(read32, session, "Mod1", 16);
    EXPECT_EQ(answer.code, -250978);
    EXPECT_EQ(answer.text, detailsOf("unmappedRegister", where(16, 32)));
    EXPECT_EQ(answer.value, 0u);
    EXPECT_EQ(read(read8, session, "Mod1", 511).code, 0);
    EXPECT_EQ(read(read8, session, "Mod1", 512).code, -250978);
    EXPECT_EQ(read(read8, session, "Mod1", 4294967295u).code, -250978);
    EXPECT_EQ(read(read64, session, "Mod1", 4294967288u).code, -250978);
    EXPECT_EQ(write(write8, session, "Mod1", 16, std::uint8_t{1}), -250978);
    EXPECT_EQ(read(read8, session, "Bench", 0).code, -250978);
}

TEST_F(RegisterTest, AMisalignedAddressIsRefused) {
    const auto answer = read(read32, session, "Mod1", 2);
    EXPECT_EQ(answer.code, -250979);
    EXPECT_EQ(answer.text, detailsOf("misalignedRegister", where(2, 32)));
    EXPECT_EQ(read(read16, session, "Mod1", 1).code, -250979);
    EXPECT_EQ(write(write64, session, "Mod1", 260, std::uint64_t{1}), -250979);
}

TEST_F(RegisterTest, AReadOnlyRegisterIsNotWritten) {
    EXPECT_EQ(write(write8, session, "Mod1", 0, std::uint8_t{1}), -250980);
    EXPECT_EQ(read(read8, session, "Mod1", 0), std::uint8_t{0x4d});
}

TEST_F(RegisterTest, ExactlyOneDeviceMustBeNamed) {
    EXPECT_EQ(read(read8, session, "Mod1,Mod2", 0).code, -250966);
    EXPECT_EQ(read(read8, session, "", 0).code, -250959);
    EXPECT_EQ(read(read8, session, "Mod1/ch0", 0).code, -250956);
    EXPECT_EQ(read(read8, session, nullptr, 0).code, -250954);
    Session one("Bench");
    EXPECT_EQ(read(read8, one, "$DefaultDevices", 0).code, -250978);
}

TEST_F(RegisterTest, WritingNeedsWriteAccessToTheDevice) {
    Session other;
    EXPECT_EQ(write(write8, other, "Mod1", 256, std::uint8_t{1}), -250811);
    EXPECT_EQ(read(read8, other, "Mod1", 256), std::uint8_t{0});
}

TEST_F(RegisterTest, AResetRestoresRegisters) {
    EXPECT_EQ(write(write8, session, "Mod1", 256, std::uint8_t{1}), 0);
    EXPECT_EQ(resetDevices(session, "Mod1"), 0);
    EXPECT_EQ(read(read8, session, "Mod1", 256), std::uint8_t{0});
}

}  // namespace
