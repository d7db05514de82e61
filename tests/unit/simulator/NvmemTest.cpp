#include "Values.h"

using namespace drivertest;

namespace {

using Bytes = std::vector<std::uint8_t>;

Answer<Bytes> read(Handle session, const char* area, std::uint32_t address, std::uint32_t size) {
    Answer<Bytes> answer;
    answer.value.resize(size, 0xEE);
    Status status;
    nQITRMCAPI100_getNvmemBytes(session, area, address, size == 0 ? nullptr : answer.value.data(),
                                size, &status);
    answer.code = status.code;
    answer.text = status.text();
    return answer;
}

Outcome write(Handle session, const char* area, std::uint32_t address, const Bytes& bytes,
              const char* serialNumber = "", const char* password = "") {
    Status status;
    nQITRMCAPI100_setNvmemBytes(session, area, address, bytes.data(),
                                static_cast<std::uint32_t>(bytes.size()), serialNumber, password,
                                &status);
    return {status.code, status.text()};
}

std::int32_t commit(Handle session, const char* resources) {
    Status status;
    nQITRMCAPI100_commitNvmemGeneric(session, resources, &status);
    return status.code;
}

// Fills the user area of Mod1 with zeros at the end.
class NvmemTest : public BenchTest {
  protected:
    ~NvmemTest() override {
        session.reserve("Mod1");
        EXPECT_EQ(write(session, "Mod1/user", 0, Bytes(256)).code, 0);
        EXPECT_EQ(commit(session, "Mod1/user"), 0);
    }
};

TEST_F(NvmemTest, AnAreaIsReadInAnyPart) {
    EXPECT_EQ(read(session, "Mod1/calibration", 0, 5), (Bytes{0, 1, 2, 3, 0}));
    EXPECT_EQ(read(session, "mod1/Calibration", 2, 2), (Bytes{2, 3}));
    EXPECT_EQ(read(session, "Mod1/user", 255, 1), Bytes{0});
}

TEST_F(NvmemTest, ZeroBytesCanBeReadAnywhereInTheArea) {
    EXPECT_EQ(read(session, "Mod1/user", 0, 0), Bytes());
    EXPECT_EQ(read(session, "Mod1/user", 256, 0), Bytes());
    EXPECT_EQ(read(session, "Mod1/user", 257, 0).code, -250981);
}

TEST_F(NvmemTest, BytesOutsideOfTheAreaAreRefused) {
    const auto answer = read(session, "Mod1/user", 250, 7);
    EXPECT_EQ(answer.code, -250981);
    const auto number = [](const char* tag, std::uint32_t value) {
        return std::string("{\"type\":\"usage\",\"usage\":\"kUsageType") + tag +
               "\",\"value\":" + std::to_string(value) + ",\"value_type\":\"uint32_t\"}";
    };
    EXPECT_EQ(answer.text, detailsOf("nvmemOutOfRange", number("NvmemAddress", 250) + "," +
                                                            number("RequestedBytes", 7) + "," +
                                                            number("NvmemAreaSize", 256)));
    std::uint8_t byte = 0;
    Status huge;
    nQITRMCAPI100_getNvmemBytes(session, "Mod1/user", 1, &byte, 4294967295u, &huge);
    EXPECT_EQ(huge.code, -250981);
    EXPECT_EQ(write(session, "Mod1/user", 4294967295u, {1}).code, -250981);
}

TEST_F(NvmemTest, WrittenBytesAreReadBackAtOnce) {
    EXPECT_EQ(write(session, "Mod1/user", 254, {7, 8}).code, 0);
    EXPECT_EQ(read(session, "Mod1/user", 253, 3), (Bytes{0, 7, 8}));
    EXPECT_EQ(get(getBool, session, "Mod1/user", "NVMEMArea.PendingChanges"), std::uint8_t{1});
}

TEST_F(NvmemTest, OnlyCommittedBytesSurviveAReset) {
    EXPECT_EQ(write(session, "Mod1/user", 0, {1, 2}).code, 0);
    EXPECT_EQ(commit(session, "Mod1/user"), 0);
    EXPECT_EQ(get(getBool, session, "Mod1/user", "NVMEMArea.PendingChanges"), std::uint8_t{0});
    EXPECT_EQ(write(session, "Mod1/user", 1, {9}).code, 0);
    EXPECT_EQ(resetDevices(session, "Mod1"), 0);
    EXPECT_EQ(read(session, "Mod1/user", 0, 3), (Bytes{1, 2, 0}));
}

TEST_F(NvmemTest, CommittingADeviceCommitsAllItsAreas) {
    EXPECT_EQ(write(session, "Mod1/user", 0, {5}).code, 0);
    EXPECT_EQ(commit(session, "Mod1"), 0);
    EXPECT_EQ(resetDevices(session, "Mod1"), 0);
    EXPECT_EQ(read(session, "Mod1/user", 0, 1), Bytes{5});
}

TEST_F(NvmemTest, ClosingASessionDropsItsUncommittedBytes) {
    session.unreserve("Mod1");
    Session writer("Mod1");
    EXPECT_EQ(write(writer, "Mod1/user", 0, {5}).code, 0);
    writer.close();
    EXPECT_EQ(read(session, "Mod1/user", 0, 1), Bytes{0});
}

TEST_F(NvmemTest, AProtectedAreaNeedsSerialNumberAndPassword) {
    const Outcome outcome = write(session, "Mod1/calibration", 0, {1}, "12345", "calibrate");
    EXPECT_EQ(outcome.code, -250983);
    EXPECT_EQ(outcome.text, detailsOf("wrongSerialNumber", usage("RequestedValue", "\"12345\"")));
    const Outcome password = write(session, "Mod1/calibration", 0, {1}, "0C5110B1", "guess");
    EXPECT_EQ(password.code, -250984);
    EXPECT_EQ(password.text, detailsOf("wrongPassword", ""));
    EXPECT_EQ(write(session, "Mod1/calibration", 0, {1}).code, -250983);
    EXPECT_EQ(read(session, "Mod1/calibration", 0, 1), Bytes{0});
    EXPECT_EQ(write(session, "Mod1/calibration", 0, {1}, "0C5110B1", "calibrate").code, 0);
    EXPECT_EQ(read(session, "Mod1/calibration", 0, 1), Bytes{1});
}

TEST_F(NvmemTest, AReadOnlyAreaIsNotWritten) {
    EXPECT_EQ(write(session, "Mod5/calibration", 0, {1}).code, -250982);
}

TEST_F(NvmemTest, ExactlyOneAreaMustBeNamed) {
    EXPECT_EQ(read(session, "Mod1/user,Mod1/calibration", 0, 1).code, -250966);
    EXPECT_EQ(read(session, "Mod1", 0, 1).code, -250958);
    EXPECT_EQ(read(session, "", 0, 1).code, -250959);
    EXPECT_EQ(commit(session, "Mod1/ch0"), -250958);
    EXPECT_EQ(commit(session, ""), -250959);
}

TEST_F(NvmemTest, NullBuffersAreRefusedUnlessNothingIsMoved) {
    Status reading;
    nQITRMCAPI100_getNvmemBytes(session, "Mod1/user", 0, nullptr, 1, &reading);
    EXPECT_EQ(reading.code, -250954);
    Status writing;
    nQITRMCAPI100_setNvmemBytes(session, "Mod1/user", 0, nullptr, 1, "", "", &writing);
    EXPECT_EQ(writing.code, -250954);
    Status nothing;
    nQITRMCAPI100_setNvmemBytes(session, "Mod1/user", 0, nullptr, 0, "", "", &nothing);
    EXPECT_EQ(nothing.code, 0);
}

TEST_F(NvmemTest, WritingNeedsWriteAccessToTheDevice) {
    Session other;
    EXPECT_EQ(write(other, "Mod1/user", 0, {1}).code, -250811);
    EXPECT_EQ(commit(other, "Mod1/user"), -250811);
    session.reserve("Mod1", 1);
    EXPECT_EQ(write(session, "Mod1/user", 0, {1}).code, -250972);
}

}  // namespace
