#include <limits>

#include "Driver.h"

using namespace drivertest;

namespace {

constexpr std::int32_t taken = -250811;

TEST(ReservationTest, ReadWriteIsExclusive) {
    Session holder("Mod1", 3);
    Session other;
    EXPECT_EQ(other.reserve("Mod1", 3), taken);
    EXPECT_EQ(other.reserve("Mod1", 1), taken);
    EXPECT_EQ(other.list("Session.ReservedDevices"), Names());
}

TEST(ReservationTest, ReadOnlyIsSharedOnlyWithReaders) {
    Session holder("Mod1", 1);
    Session other;
    EXPECT_EQ(other.reserve("Mod1", 3), taken);
    EXPECT_EQ(other.reserve("Mod1", 1), 0);
}

TEST(ReservationTest, TheSameGroupShares) {
    Session first("Mod1", 3, "bench A");
    Session second("Mod1", 3, "bench A");
    Session third;
    EXPECT_EQ(third.reserve("Mod1", 3, "bench B"), taken);
    EXPECT_EQ(third.reserve("Mod1", 3, "BENCH A"), taken);
    EXPECT_EQ(third.reserve("Mod1", 3, ""), taken);
    EXPECT_EQ(third.reserve("Mod1", 1, ""), taken);
    EXPECT_EQ(third.reserve("Mod1", 3, "bench A"), 0);
}

TEST(ReservationTest, TwoSessionsWithoutAGroupDoNotShare) {
    Session first("Mod1", 3, "");
    Session second;
    EXPECT_EQ(second.reserve("Mod1", 3, ""), taken);
}

TEST(ReservationTest, TheDetailsNameTheReservedDevice) {
    Session holder("Mod2");
    Status status;
    Session other;
    nQITRMCAPI100_reserveDevices(other, "mod1,mod2,Mod4", 3, "", 0.0, &status);
    EXPECT_EQ(status.code, taken);
    EXPECT_EQ(status.text(), detailsOf("deviceReserved", usage("Device", "\"Mod2\"")));
}

TEST(ReservationTest, TheDetailsNameAllReservedDevices) {
    Session holder("Mod1,Mod2");
    Status status;
    Session other;
    nQITRMCAPI100_reserveDevices(other, "Mod2,Mod4,Mod1", 3, "", 0.0, &status);
    EXPECT_EQ(status.code, taken);
    EXPECT_EQ(status.text(), detailsOf("deviceReserved", usage("Devices", "[\"Mod2\",\"Mod1\"]")));
}

TEST(ReservationTest, AllDevicesAreReservedOrNone) {
    Session holder("Mod2");
    Session other;
    EXPECT_EQ(other.reserve("Mod1,Mod2"), taken);
    EXPECT_EQ(other.list("Session.ReservedDevices"), Names());
    Session third("Mod1");
}

TEST(ReservationTest, ADeviceNamedTwiceIsReservedOnce) {
    Session session("Mod1,mod1");
    EXPECT_EQ(session.list("Session.ReservedDevices"), Names{"Mod1"});
    EXPECT_EQ(session.unreserve("Mod1"), 0);
    Session other("Mod1");
}

TEST(ReservationTest, ReservingAgainReplacesTheAccess) {
    Session session("Mod1", 3);
    Session other;
    EXPECT_EQ(session.reserve("Mod1", 1), 0);
    EXPECT_EQ(other.reserve("Mod1", 1), 0);
    EXPECT_EQ(session.reserve("Mod1", 3), taken);
    EXPECT_EQ(other.unreserve("Mod1"), 0);
    EXPECT_EQ(session.reserve("Mod1", 3), 0);
    EXPECT_EQ(other.reserve("Mod1", 1), taken);
}

TEST(ReservationTest, UnreservingOneOfTwoKeepsTheOther) {
    Session session("Mod1,Mod2");
    EXPECT_EQ(session.unreserve("Mod1"), 0);
    EXPECT_EQ(session.list("Session.ReservedDevices"), Names{"Mod2"});
    Session other("Mod1");
    EXPECT_EQ(other.reserve("Mod2"), taken);
}

TEST(ReservationTest, UnreservingWhatIsNotHeldWarns) {
    Session holder("Mod2");
    Session session("Mod1");
    Status status;
    nQITRMCAPI100_unreserveDevices(session, "Mod1,Mod2", &status);
    EXPECT_EQ(status.code, 250990);
    EXPECT_EQ(status.text(), detailsOf("nothingToRelease", usage("Devices", "[\"Mod2\"]")));
    EXPECT_EQ(session.list("Session.ReservedDevices"), Names());
    EXPECT_EQ(holder.list("Session.ReservedDevices"), Names{"Mod2"});
}

TEST(ReservationTest, ClosingReleasesReservations) {
    Session holder("Mod1,Mod2");
    holder.close();
    Session other("Mod1,Mod2");
}

TEST(ReservationTest, TokensStandForTheSessionsOwnLists) {
    Session session("Mod1,Mod2");
    EXPECT_EQ(session.unreserve("$DefaultDevices"), 0);
    EXPECT_EQ(session.list("Session.ReservedDevices"), Names());
    EXPECT_EQ(session.reserve("$DefaultDevices"), 0);
    EXPECT_EQ(session.reserve("Mod4"), 0);
    EXPECT_EQ(session.unreserve("$ReservedDevices"), 0);
    EXPECT_EQ(session.list("Session.ReservedDevices"), Names());
    EXPECT_EQ(session.unreserve("$ReservedDevices"), -250959);
}

TEST(ReservationTest, ATokenOfAnotherKindIsRefused) {
    Status opened;
    Session session;
    session.close();
    nQITRMCAPI100_initializeSessionWithPhysChans(&session.handle, "Mod1/ch0", 60.0, 3, "", 0.0,
                                                 &opened);
    EXPECT_EQ(session.reserve("$DefaultPhysChans"), -250956);
}

TEST(ReservationTest, OtherAccessesAreRefused) {
    Session session;
    for (const std::int32_t access : {0, 2, 4, -1}) {
        EXPECT_EQ(session.reserve("Mod1", access), -250961) << access;
    }
}

TEST(ReservationTest, InvalidTimeoutsAreRefused) {
    Session session;
    EXPECT_EQ(session.reserve("Mod1", 3, "", -1.0), -250962);
    EXPECT_EQ(session.reserve("Mod1", 3, "", std::numeric_limits<double>::quiet_NaN()), -250962);
    EXPECT_EQ(session.reserve("Mod1", 3, "", std::numeric_limits<double>::infinity()), 0);
}

TEST(ReservationTest, ANullTextIsRefusedByName) {
    Session session;
    Status status;
    nQITRMCAPI100_reserveDevices(session, "Mod1", 3, nullptr, 0.0, &status);
    EXPECT_EQ(status.code, -250954);
    EXPECT_EQ(status.text(),
              detailsOf("missingArgument", usage("ArgumentName", "\"reservationGroup\"")));
}

TEST(ReservationTest, NothingIsDoneWhenTheStatusIsNegative) {
    Session session;
    Status status;
    status.code = -1;
    nQITRMCAPI100_reserveDevices(session, "Mod1", 3, "", 0.0, &status);
    EXPECT_EQ(status.code, -1);
    EXPECT_EQ(status.growths, 0u);
    EXPECT_EQ(session.list("Session.ReservedDevices"), Names());
}

TEST(ReservationTest, AWaitThatTimesOutDoesNotTakeTheDevice) {
    Session holder("Mod1");
    Session other;
    EXPECT_EQ(other.reserve("Mod1", 3, "", 0.01), taken);
    EXPECT_EQ(holder.list("Session.ReservedDevices"), Names{"Mod1"});
}

}  // namespace
