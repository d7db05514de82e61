#include <memory>

#include "Driver.h"

using namespace drivertest;

namespace {

TEST(SessionTest, HandlesAreDistinctAndNotZero) {
    Session first;
    Session second;
    EXPECT_NE(first.handle, 0u);
    EXPECT_NE(second.handle, 0u);
    EXPECT_NE(first.handle, second.handle);
}

TEST(SessionTest, ASessionWithoutResourcesHasEmptyLists) {
    Session session;
    EXPECT_EQ(session.list("Session.DefaultDevices"), Names());
    EXPECT_EQ(session.list("Session.DefaultPhysChans"), Names());
    EXPECT_EQ(session.list("Session.DefaultNVMEMAreas"), Names());
    EXPECT_EQ(session.list("Session.ReservedDevices"), Names());
    EXPECT_EQ(session.list("Session.ConnectedDevices"), Names());
}

TEST(SessionTest, DevicesOfTheOpeningAreDefaultsAndReserved) {
    Session session("Mod4,Mod1");
    EXPECT_EQ(session.list("Session.DefaultDevices"), (Names{"Mod4", "Mod1"}));
    EXPECT_EQ(session.list("Session.DefaultPhysChans"), Names());
    EXPECT_EQ(session.list("Session.ReservedDevices"), (Names{"Mod1", "Mod4"}));
}

TEST(SessionTest, ChannelsOfTheOpeningAreDefaultsAndReserveTheirDevices) {
    Status status;
    Session session;
    session.close();
    nQITRMCAPI100_initializeSessionWithPhysChans(&session.handle, "Mod1/ch1:2,Mod2/ch0", 60.0, 3,
                                                 "", 0.0, &status);
    ASSERT_EQ(status.code, 0) << status.text();
    EXPECT_EQ(session.list("Session.DefaultPhysChans"),
              (Names{"Mod1/ch1", "Mod1/ch2", "Mod2/ch0"}));
    EXPECT_EQ(session.list("Session.DefaultDevices"), (Names{"Mod1", "Mod2"}));
    EXPECT_EQ(session.list("Session.DefaultNVMEMAreas"), Names());
    EXPECT_EQ(session.list("Session.ReservedDevices"), (Names{"Mod1", "Mod2"}));
}

TEST(SessionTest, AreasOfTheOpeningAreDefaultsAndReserveTheirDevices) {
    Status status;
    Session session;
    session.close();
    nQITRMCAPI100_initializeSessionWithNvmemAreas(&session.handle, "Mod5/user,Mod5/calibration",
                                                  60.0, 1, "", 0.0, &status);
    ASSERT_EQ(status.code, 0) << status.text();
    EXPECT_EQ(session.list("Session.DefaultNVMEMAreas"), (Names{"Mod5/user", "Mod5/calibration"}));
    EXPECT_EQ(session.list("Session.DefaultPhysChans"), Names());
    EXPECT_EQ(session.list("Session.DefaultDevices"), Names{"Mod5"});
    EXPECT_EQ(session.list("Session.ReservedDevices"), Names{"Mod5"});
}

TEST(SessionTest, AClosedHandleIsRefusedByNumber) {
    Session session;
    const Handle dead = session.handle;
    EXPECT_EQ(session.close(), 0);
    Status status;
    nQITRMCAPI100_closeSession(dead, &status);
    EXPECT_EQ(status.code, -250955);
    EXPECT_EQ(status.text(),
              detailsOf("unknownSession",
                        "{\"type\":\"usage\",\"usage\":\"kUsageTypeSessionHandle\",\"value\":" +
                            std::to_string(dead) + ",\"value_type\":\"uint32_t\"}"));
    Status abort;
    nQITRMCAPI100_abortSession(dead, &abort);
    EXPECT_EQ(abort.code, -250955);
    Status zero;
    nQITRMCAPI100_abortSession(0, &zero);
    EXPECT_EQ(zero.code, -250955);
}

TEST(SessionTest, AHandleIsNotReusedImmediately) {
    Session session;
    const Handle dead = session.handle;
    session.close();
    Session next;
    EXPECT_NE(next.handle, dead);
}

TEST(SessionTest, AbortLeavesTheSessionUsable) {
    Session session("Mod1");
    EXPECT_EQ(session.abort(), 0);
    EXPECT_EQ(session.list("Session.ReservedDevices"), Names{"Mod1"});
    EXPECT_EQ(session.reserve("Mod2"), 0);
}

TEST(SessionTest, HundredsOfSessionsAreOpenAtOnce) {
    std::vector<std::unique_ptr<Session>> sessions;
    for (int i = 0; i < 500; ++i) {
        sessions.push_back(std::make_unique<Session>("Mod1", 1));
    }
    EXPECT_EQ(sessions.front()->list("Session.ReservedDevices"), Names{"Mod1"});
    Session other;
    EXPECT_EQ(other.reserve("Mod1", 3), -250811);
    sessions.clear();
    EXPECT_EQ(other.reserve("Mod1", 3), 0);
}

TEST(SessionTest, AFailedOpeningLeavesNoSessionAndNoReservation) {
    Status status;
    Handle handle = 77;
    nQITRMCAPI100_initializeSessionWithDevices(&handle, "Mod1,Mod3", 60.0, 3, "", 0.0, &status);
    EXPECT_EQ(status.code, -250956);
    EXPECT_EQ(handle, 0u);
    Session other;
    EXPECT_EQ(other.reserve("Mod1"), 0);
}

TEST(SessionTest, OpeningOnNothingIsRefused) {
    Status status;
    Handle handle = 77;
    nQITRMCAPI100_initializeSessionWithDevices(&handle, "", 60.0, 3, "", 0.0, &status);
    EXPECT_EQ(status.code, -250959);
    EXPECT_EQ(handle, 0u);
    Status token;
    nQITRMCAPI100_initializeSessionWithDevices(&handle, "$DefaultDevices", 60.0, 3, "", 0.0,
                                               &token);
    EXPECT_EQ(token.code, -250959);
}

}  // namespace
