#include "qitrmcwebsvc/SessionManager.h"

#include <functional>
#include <future>
#include <memory>
#include <new>
#include <string>

#include "support/DriverTest.h"
#include "support/Failures.h"
#include "support/ObservedThread.h"

using namespace nQITRMCWEBSVC100;

namespace {

class SessionManagerTest : public DriverTest {
  protected:
    // Destroys the manager, which closes the open sessions, before the driver's lent memory is
    // checked.
    void TearDown() override {
        manager.reset();
        DriverTest::TearDown();
    }

    std::string openBare(std::uint64_t handle) {
        driver.give("initializeSessionWithoutResources", handle);
        return manager->createSession();
    }

    std::string openOnDevices(std::uint64_t handle, const std::vector<std::string>& names,
                              std::int32_t access = 3, bool force = false) {
        driver.give("initializeSessionWithDevices", handle);
        return manager->createSession(ResourceKind::Device, names, access, "", 0.0, force);
    }

    void holds(std::uint64_t handle, const Calls& devices) {
        driver.give(reservedDevicesOf(handle), devices);
    }

    static std::string reservedDevicesOf(std::uint64_t handle) {
        return "getSessionPropertyStringArray(" + std::to_string(handle) +
               ", \"Session.ReservedDevices\")";
    }

    std::unique_ptr<SessionManager> manager = std::make_unique<SessionManager>();
};

TEST_F(SessionManagerTest, OpensASessionWithoutResources) {
    EXPECT_EQ(openBare(1), "_session1");
    EXPECT_EQ(driver.takeCalls(), Calls{"initializeSessionWithoutResources()"});
    const auto context = manager->getSessionContext("_session1");
    EXPECT_EQ(context->defaultResourceKind, ResourceKind::None);
    EXPECT_EQ(context->access, 0);
    EXPECT_EQ(context->driverSession, 1u);
}

TEST_F(SessionManagerTest, SignExtendsAHandle) {
    EXPECT_EQ(openBare(2147483649u), "_session18446744071562067969");
    EXPECT_EQ(openBare(2147483647u), "_session2147483647");
}

TEST_F(SessionManagerTest, OpensASessionOnEachKindOfResource) {
    driver.give("initializeSessionWithDevices", std::uint64_t{1});
    driver.give("initializeSessionWithPhysChans", std::uint64_t{2});
    driver.give("initializeSessionWithNvmemAreas", std::uint64_t{3});
    manager->createSession(ResourceKind::Device, {"Mod1", "Mod2"}, 3, "group", 2.5, false);
    manager->createSession(ResourceKind::PhysicalChannel, {"Mod1/ch0", "Mod1/ch1"}, 1, "", 0.0,
                           false);
    manager->createSession(ResourceKind::NvmemArea, {"Mod1/user"}, 3, "", 0.0, false);
    EXPECT_EQ(driver.takeCalls(),
              (Calls{"initializeSessionWithDevices(\"Mod1,Mod2\", 60, 3, \"group\", 2.5)",
                     "initializeSessionWithPhysChans(\"Mod1/ch0:1\", 60, 1, \"\", 0)",
                     "initializeSessionWithNvmemAreas(\"Mod1/user\", 60, 3, \"\", 0)"}));
    const auto context = manager->getSessionContext("_session2");
    EXPECT_EQ(context->defaultResourceKind, ResourceKind::PhysicalChannel);
    EXPECT_EQ(context->access, 1);
}

TEST_F(SessionManagerTest, RefusesKindsThatCannotBeOpened) {
    EXPECT_EQ(failureOf([&] { manager->createSession(ResourceKind::None, {}, 3, "", 0, false); }),
              "InternalError: -250800 comment=Unsupported resource type");
    EXPECT_EQ(failureOf([&] {
                  manager->createSession(static_cast<ResourceKind>(4), {}, 3, "", 0, false);
              }),
              "InternalError: -250800 comment=Unsupported resource type");
    EXPECT_EQ(driver.takeCalls(), Calls{});
}

TEST_F(SessionManagerTest, RefusesAHandleOfZero) {
    EXPECT_EQ(failureOf([&] { openOnDevices(0, {"Mod1"}); }),
              "InternalError: -250800 comment=Fail to initialize session.");
    EXPECT_EQ(failureOf([&] { manager->getSessionContext("_session0"); }),
              "BasicError: -250833 kUsageTypeSessionId=_session0");
}

TEST_F(SessionManagerTest, PassesADriverErrorOnAndAddsNoSession) {
    driver.reply("initializeSessionWithDevices", {std::uint64_t{5}, -7, "{\"line\":1}"});
    EXPECT_EQ(
        failureOf([&] { manager->createSession(ResourceKind::Device, {"Mod1"}, 3, "", 0, false); }),
        "Exception: -7");
    driver.fail("initializeSessionWithoutResources", -8);
    EXPECT_EQ(failureOf([&] { manager->createSession(); }), "Exception: -8");
    EXPECT_EQ(failureOf([&] { manager->getSessionContext("_session5"); }),
              "BasicError: -250833 kUsageTypeSessionId=_session5");
}

TEST_F(SessionManagerTest, DropsAWarning) {
    driver.reply("initializeSessionWithDevices", {std::uint64_t{5}, 17});
    EXPECT_EQ(manager->createSession(ResourceKind::Device, {"Mod1"}, 3, "", 0, false), "_session5");
}

TEST_F(SessionManagerTest, ClosesASessionOnce) {
    openBare(4);
    driver.takeCalls();
    manager->closeSession("_session4");
    EXPECT_EQ(driver.takeCalls(), Calls{"closeSession(4)"});
    EXPECT_EQ(failureOf([&] { manager->closeSession("_session4"); }),
              "BasicError: -250833 kUsageTypeSessionId=_session4");
    EXPECT_EQ(driver.takeCalls(), Calls{});
}

TEST_F(SessionManagerTest, KeepsASessionThatTheDriverDoesNotClose) {
    openBare(4);
    driver.fail("closeSession(4)", -9);
    EXPECT_EQ(failureOf([&] { manager->closeSession("_session4"); }), "Exception: -9");
    EXPECT_EQ(manager->getSessionContext("_session4")->driverSession, 4u);
}

TEST_F(SessionManagerTest, KeepsTheRecordOfAClosedSessionWhileItIsUsed) {
    openBare(4);
    const auto context = manager->getSessionContext("_session4");
    manager->closeSession("_session4");
    EXPECT_EQ(context->driverSession, 4u);
}

TEST_F(SessionManagerTest, LimitsSessionsWithResourcesOnly) {
    for (std::uint64_t handle = 1; handle <= 100; ++handle) {
        openOnDevices(handle, {"Mod" + std::to_string(handle)});
    }
    EXPECT_EQ(failureOf([&] { openOnDevices(101, {"Mod101"}); }), "BasicError: -250901");
    EXPECT_EQ(openBare(102), "_session102");
}

TEST_F(SessionManagerTest, DisplacesSessionsByForceBeforeItChecksTheLimit) {
    for (std::uint64_t handle = 1; handle <= 100; ++handle) {
        openOnDevices(handle, {"Mod" + std::to_string(handle)});
    }
    holds(7, {"Mod7"});
    driver.takeCalls();
    EXPECT_EQ(openOnDevices(101, {"Mod7"}, 3, true), "_session101");
    EXPECT_THAT(driver.takeCalls(), ::testing::Contains("closeSession(7)"));
    EXPECT_EQ(failureOf([&] { manager->getSessionContext("_session7"); }),
              "BasicError: -250833 kUsageTypeSessionId=_session7");
    EXPECT_EQ(failureOf([&] { openOnDevices(102, {"Mod102"}); }), "BasicError: -250901");
}

TEST_F(SessionManagerTest, NamesTheWritersThatHoldAReservedDeviceInKeyOrder) {
    for (std::uint64_t handle : {9, 10, 11, 12}) {
        openOnDevices(handle, {"Mod1"}, handle == 11 ? 1 : 3);
        holds(handle, {"Mod0", "Mod1"});
    }
    holds(12, {"Mod2"});
    driver.takeCalls();
    driver.fail("initializeSessionWithDevices", -250811);
    EXPECT_EQ(
        failureOf([&] { manager->createSession(ResourceKind::Device, {"Mod1"}, 3, "", 0, false); }),
        "Exception: -250811 kUsageTypeReservedBySessions=[\"_session10\",\"_session9\"]");
    EXPECT_EQ(driver.takeCalls(),
              (Calls{"initializeSessionWithDevices(\"Mod1\", 60, 3, \"\", 0)",
                     reservedDevicesOf(10), "freeStringArray(2)", reservedDevicesOf(11),
                     "freeStringArray(2)", reservedDevicesOf(12), "freeStringArray(1)",
                     reservedDevicesOf(9), "freeStringArray(2)"}));
}

TEST_F(SessionManagerTest, AddsItsReportAfterTheDriversOwnDetails) {
    openOnDevices(1, {"Mod1"});
    holds(1, {"Mod1"});
    driver.fail("initializeSessionWithDevices", -250811,
                "{\"translator\":\"mxlator_qitrmc\",\"translator_info\":{\"ordered_data\":["
                "{\"type\":\"usage\",\"usage\":\"kUsageTypeDevice\",\"value\":\"Mod1\","
                "\"value_type\":\"string\"}]}}");
    EXPECT_EQ(
        failureOf([&] { manager->createSession(ResourceKind::Device, {"Mod1"}, 3, "", 0, false); }),
        "Exception: -250811 kUsageTypeDevice=Mod1 "
        "kUsageTypeReservedBySessions=[\"_session1\"]");
}

TEST_F(SessionManagerTest, AddsNoReportWhenOnlyReadersOrOthersHoldTheDevice) {
    openOnDevices(1, {"Mod1"}, 1);
    holds(1, {"Mod1"});
    driver.fail("initializeSessionWithDevices", -250811);
    EXPECT_EQ(
        failureOf([&] { manager->createSession(ResourceKind::Device, {"Mod1"}, 3, "", 0, false); }),
        "Exception: -250811");
}

TEST_F(SessionManagerTest, ListsHoldersByTheirLatestAccess) {
    openOnDevices(1, {"Mod1"}, 2);
    openOnDevices(2, {"Mod1"}, 3);
    openOnDevices(3, {"Mod1"}, 3);
    for (std::uint64_t handle : {1, 2, 3}) {
        holds(handle, {"Mod1"});
    }
    manager->unreserveDevices("_session2", {"Mod2"});
    manager->reserveDevices("_session3", {"Mod2"}, 1, "", 0);
    driver.fail("initializeSessionWithDevices", -250811);
    EXPECT_EQ(
        failureOf([&] { manager->createSession(ResourceKind::Device, {"Mod1"}, 3, "", 0, false); }),
        "Exception: -250811 kUsageTypeReservedBySessions=[\"_session1\"]");
}

TEST_F(SessionManagerTest, ReadsNoReservationsWhenNoDeviceIsNamed) {
    openOnDevices(1, {"Mod1"});
    driver.takeCalls();
    EXPECT_EQ(openOnDevices(2, {}, 3, true), "_session2");
    driver.fail("reserveDevices", -250811);
    EXPECT_EQ(failureOf([&] { manager->reserveDevices("_session1", {}, 3, "", 0); }),
              "Exception: -250811");
    EXPECT_EQ(driver.takeCalls(), (Calls{"initializeSessionWithDevices(\"\", 60, 3, \"\", 0)",
                                         "reserveDevices(1, \"\", 3, \"\", 0)"}));
}

TEST_F(SessionManagerTest, TreatsASessionWithUnreadableReservationsAsHoldingNothing) {
    openOnDevices(1, {"Mod1"});
    driver.reply(reservedDevicesOf(1), {Calls{"Mod1"}, -3});
    driver.fail("initializeSessionWithDevices", -250811);
    EXPECT_EQ(
        failureOf([&] { manager->createSession(ResourceKind::Device, {"Mod1"}, 3, "", 0, false); }),
        "Exception: -250811");
}

TEST_F(SessionManagerTest, DisplacesReadersAndWritersByForce) {
    openOnDevices(1, {"Mod1"}, 1);
    openOnDevices(2, {"Mod1"}, 3);
    openOnDevices(3, {"Mod2"}, 3);
    holds(1, {"Mod1"});
    holds(2, {"Mod1"});
    holds(3, {"Mod2"});
    driver.takeCalls();
    openOnDevices(4, {"Mod1"}, 3, true);
    EXPECT_EQ(
        driver.takeCalls(),
        (Calls{reservedDevicesOf(1), "freeStringArray(1)", "closeSession(1)", reservedDevicesOf(2),
               "freeStringArray(1)", "closeSession(2)", reservedDevicesOf(3), "freeStringArray(1)",
               "initializeSessionWithDevices(\"Mod1\", 60, 3, \"\", 0)"}));
}

TEST_F(SessionManagerTest, StopsDisplacingAtTheFirstErrorAndKeepsTheRest) {
    for (std::uint64_t handle : {1, 2, 3}) {
        openOnDevices(handle, {"Mod1"});
        holds(handle, {"Mod1"});
    }
    driver.fail("closeSession(2)", -4);
    EXPECT_EQ(failureOf([&] { openOnDevices(4, {"Mod1"}, 3, true); }), "Exception: -4");
    EXPECT_NE(failureOf([&] { manager->getSessionContext("_session1"); }), "nothing");
    EXPECT_EQ(failureOf([&] { manager->getSessionContext("_session2"); }), "nothing");
    EXPECT_EQ(failureOf([&] { manager->getSessionContext("_session3"); }), "nothing");
}

TEST_F(SessionManagerTest, ComparesChannelsAndAreasByTheirDevice) {
    openOnDevices(1, {"Mod1"});
    holds(1, {"Mod1"});
    driver.give("initializeSessionWithPhysChans", std::uint64_t{2});
    manager->createSession(ResourceKind::PhysicalChannel, {"Mod1/ch0"}, 3, "", 0, true);
    EXPECT_NE(failureOf([&] { manager->getSessionContext("_session1"); }), "nothing");
    holds(2, {"Mod1"});
    driver.give("initializeSessionWithNvmemAreas", std::uint64_t{3});
    manager->createSession(ResourceKind::NvmemArea, {"Mod1/user/deep"}, 3, "", 0, true);
    EXPECT_NE(failureOf([&] { manager->getSessionContext("_session2"); }), "nothing");
    holds(3, {"Mod1"});
    manager->createSession(ResourceKind::NvmemArea, {"Mod1"}, 3, "", 0, true);
}

TEST_F(SessionManagerTest, ComparesCompleteNamesOfDevices) {
    openOnDevices(1, {"Rack"});
    holds(1, {"Rack"});
    openOnDevices(2, {"Rack/Mod1"});
    holds(2, {"Rack/Mod1"});
    openOnDevices(3, {"Rack/Mod1"}, 3, true);
    EXPECT_EQ(failureOf([&] { manager->getSessionContext("_session1"); }), "nothing");
    EXPECT_EQ(failureOf([&] { manager->getSessionContext("_session2"); }),
              "BasicError: -250833 kUsageTypeSessionId=_session2");
}

TEST_F(SessionManagerTest, DisplacesByForceASessionThatReleasedOnlyPartOfWhatItHolds) {
    openOnDevices(1, {"Mod1", "Mod2"});
    manager->unreserveDevices("_session1", {"Mod2"});
    ASSERT_EQ(manager->getSessionContext("_session1")->access, 0);
    holds(1, {"Mod1"});
    openOnDevices(2, {"Mod1"}, 3, true);
    EXPECT_EQ(failureOf([&] { manager->getSessionContext("_session1"); }),
              "BasicError: -250833 kUsageTypeSessionId=_session1");
}

TEST_F(SessionManagerTest, KeepsTheKindOfASessionOnChannelsWhenItReservesDevices) {
    driver.give("initializeSessionWithPhysChans", std::uint64_t{1});
    manager->createSession(ResourceKind::PhysicalChannel, {"Mod1/ch0"}, 3, "", 0, false);
    manager->reserveDevices("_session1", {"Mod2"}, 1, "", 0);
    EXPECT_EQ(manager->getSessionContext("_session1")->defaultResourceKind,
              ResourceKind::PhysicalChannel);
    manager->unreserveDevices("_session1", {"Mod2"});
    EXPECT_EQ(manager->getSessionContext("_session1")->defaultResourceKind,
              ResourceKind::PhysicalChannel);
}

TEST_F(SessionManagerTest, ReservesDevicesAndRemembersTheAccess) {
    openBare(1);
    driver.takeCalls();
    manager->reserveDevices("_session1", {"Mod1", "Mod2"}, 1, "group", 0.25);
    EXPECT_EQ(driver.takeCalls(), Calls{"reserveDevices(1, \"Mod1,Mod2\", 1, \"group\", 0.25)"});
    EXPECT_EQ(manager->getSessionContext("_session1")->access, 1);
    EXPECT_EQ(manager->getSessionContext("_session1")->defaultResourceKind, ResourceKind::None);
}

TEST_F(SessionManagerTest, ReportsConflictsOfAReservationByCompleteNamesIncludingItsOwnSession) {
    openOnDevices(1, {"Mod1"});
    openOnDevices(2, {"Mod2"});
    holds(1, {"Mod1"});
    holds(2, {"Mod2"});
    driver.fail("reserveDevices", -250811);
    EXPECT_EQ(failureOf([&] {
                  manager->reserveDevices("_session2", {"Mod1", "Mod2"}, 3, "", 0);
              }),
              "Exception: -250811 kUsageTypeReservedBySessions=[\"_session1\",\"_session2\"]");
    EXPECT_EQ(failureOf([&] { manager->reserveDevices("_session2", {"Mod1/ch0"}, 3, "", 0); }),
              "Exception: -250811");
}

TEST_F(SessionManagerTest, KeepsTheAccessWhenAReservationFails) {
    openOnDevices(1, {"Mod1"});
    driver.fail("reserveDevices", -5);
    EXPECT_EQ(failureOf([&] { manager->reserveDevices("_session1", {"Mod2"}, 1, "", 0); }),
              "Exception: -5");
    EXPECT_EQ(manager->getSessionContext("_session1")->access, 3);
}

TEST_F(SessionManagerTest, ForgetsTheAccessAfterAnyRelease) {
    openOnDevices(1, {"Mod1", "Mod2"});
    driver.takeCalls();
    manager->unreserveDevices("_session1", {"Mod2"});
    EXPECT_EQ(driver.takeCalls(), Calls{"unreserveDevices(1, \"Mod2\")"});
    EXPECT_EQ(manager->getSessionContext("_session1")->access, 0);
    manager->reserveDevices("_session1", {"Mod2"}, 3, "", 0);
    EXPECT_EQ(manager->getSessionContext("_session1")->access, 3);
    driver.fail("unreserveDevices", -6);
    EXPECT_EQ(failureOf([&] { manager->unreserveDevices("_session1", {"Mod2"}); }),
              "Exception: -6");
    EXPECT_EQ(manager->getSessionContext("_session1")->access, 3);
}

TEST_F(SessionManagerTest, RefusesReservationsForUnknownSessions) {
    const std::string refusal = "BasicError: -250833 kUsageTypeSessionId=_session1";
    EXPECT_EQ(failureOf([&] { manager->reserveDevices("_session1", {"Mod1"}, 3, "", 0); }),
              refusal);
    EXPECT_EQ(failureOf([&] { manager->unreserveDevices("_session1", {"Mod1"}); }), refusal);
    EXPECT_EQ(driver.takeCalls(), Calls{});
}

TEST_F(SessionManagerTest, ClosesTheRemainingSessionsInKeyOrderAtItsEndAndIgnoresErrors) {
    for (std::uint64_t handle : {9, 10, 11}) {
        openBare(handle);
    }
    driver.fail("closeSession(10)", -1);
    driver.takeCalls();
    manager.reset();
    EXPECT_EQ(driver.takeCalls(),
              (Calls{"closeSession(10)", "closeSession(11)", "closeSession(9)"}));
}

TEST_F(SessionManagerTest, KeepsTheOldEntryOfAHandleThatIsIssuedAgain) {
    openOnDevices(1, {"Mod1"}, 1);
    EXPECT_EQ(openBare(1), "_session1");
    EXPECT_EQ(manager->getSessionContext("_session1")->access, 1);
}

// ---- One operation at a time --------------------------------------------------------------------

class SessionTableTest : public SessionManagerTest {
  protected:
    using Work = std::function<void()>;

    void SetUp() override {
        SessionManagerTest::SetUp();
        openOnDevices(1, {"Mod1"});
        openOnDevices(2, {"Mod2"});
    }

    // Whether looking up another session blocks while `work` is inside this driver call.
    bool holdsLookUpsUp(const std::string& driverCall, const Work& work) {
        std::promise<void> inside, leave;
        driver.reply(driverCall, {std::uint64_t{3}, 0, {}, [&] {
                                      inside.set_value();
                                      leave.get_future().wait();
                                  }});
        ObservedThread holder(work);
        inside.get_future().wait();
        ObservedThread other([&] { manager->getSessionContext("_session2"); });
        const bool heldUp = other.waitUntilBlocked();
        leave.set_value();
        return heldUp;
    }
};

TEST_F(SessionTableTest, ALookUpWaitsForAnOpening) {
    EXPECT_TRUE(
        holdsLookUpsUp("initializeSessionWithoutResources", [&] { manager->createSession(); }));
}

TEST_F(SessionTableTest, ALookUpWaitsForAnOpeningOnResources) {
    EXPECT_TRUE(holdsLookUpsUp("initializeSessionWithDevices", [&] {
        manager->createSession(ResourceKind::Device, {"Mod3"}, 3, "", 0, false);
    }));
}

TEST_F(SessionTableTest, ALookUpWaitsForAClose) {
    EXPECT_TRUE(holdsLookUpsUp("closeSession(1)", [&] { manager->closeSession("_session1"); }));
}

TEST_F(SessionTableTest, ALookUpWaitsForAReservation) {
    EXPECT_TRUE(holdsLookUpsUp("reserveDevices",
                               [&] { manager->reserveDevices("_session1", {"Mod3"}, 3, "", 0); }));
}

TEST_F(SessionTableTest, ALookUpWaitsForARelease) {
    EXPECT_TRUE(holdsLookUpsUp("unreserveDevices",
                               [&] { manager->unreserveDevices("_session1", {"Mod1"}); }));
}

}  // namespace
