#include "Driver.h"

using namespace drivertest;

namespace {

void refuse(Status& status) {
    Session session;
    nQITRMCAPI100_reserveDevices(session, "Nobody", 3, "", 0.0, &status);
}

const std::string refusal = detailsOf("unknownDevice", usage("RequestedValue", "\"Nobody\""));

TEST(StatusTextTest, SuccessNeedsNoText) {
    Status status;
    Handle handle = 0;
    nQITRMCAPI100_initializeSessionWithoutResources(&handle, &status);
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(status.json, nullptr);
    nQITRMCAPI100_closeSession(handle, &status);
}

TEST(StatusTextTest, TheTextFollowsTheBufferFormat) {
    Status status;
    refuse(status);
    EXPECT_EQ(status.code, -250956);
    EXPECT_EQ(status.text(), refusal);
    EXPECT_EQ(status.growths, 1u);
    EXPECT_GE(status.capacity, refusal.size() + 2);
}

TEST(StatusTextTest, ExistingRoomIsUsed) {
    Status status;
    status.reallocJson(&status, 4096);
    std::memset(status.json, 'x', 4095);
    char* const room = status.json;
    refuse(status);
    EXPECT_EQ(status.json, room);
    EXPECT_EQ(status.capacity, 4096u);
    EXPECT_EQ(status.text(), refusal);
    EXPECT_EQ(status.growths, 1u);
}

TEST(StatusTextTest, RoomThatJustFitsIsEnough) {
    Status status;
    status.reallocJson(&status, static_cast<std::uint32_t>(refusal.size() + 2));
    refuse(status);
    EXPECT_EQ(status.growths, 1u);
    EXPECT_EQ(status.text(), refusal);
}

TEST(StatusTextTest, RoomThatIsOneByteShortGrows) {
    Status status;
    status.reallocJson(&status, static_cast<std::uint32_t>(refusal.size() + 1));
    refuse(status);
    EXPECT_EQ(status.growths, 2u);
    EXPECT_EQ(status.text(), refusal);
}

TEST(StatusTextTest, WithoutRoomOnlyTheCodeIsReported) {
    Status status;
    status.starve();
    refuse(status);
    EXPECT_EQ(status.code, -250956);
    EXPECT_EQ(status.json, nullptr);
    EXPECT_EQ(status.capacity, 0u);
}

TEST(StatusTextTest, WithoutRoomTheDetailsOfAnEarlierWarningAreRemoved) {
    Status status;
    status.reallocJson(&status, 16);
    std::strcpy(status.json, "{\"old\":1}");
    status.code = 5;
    status.starve();
    refuse(status);
    EXPECT_EQ(status.code, -250956);
    EXPECT_EQ(status.text(), "{}");
}

TEST(StatusTextTest, AFailureReplacesAWarning) {
    Status status;
    status.code = 5;
    refuse(status);
    EXPECT_EQ(status.code, -250956);
    EXPECT_EQ(status.text(), refusal);
}

TEST(StatusTextTest, AWarningDoesNotReplaceAWarning) {
    Session session;
    Status status;
    status.code = 5;
    nQITRMCAPI100_unreserveDevices(session, "Mod1", &status);
    EXPECT_EQ(status.code, 5);
    EXPECT_EQ(status.json, nullptr);
}

}  // namespace
