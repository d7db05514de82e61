#include <optional>

#include "qitrmcwebsvc/SessionManager.h"
#include "support/DriverTest.h"
#include "support/allocationFaults.h"

namespace nQITRMCWEBSVC100 {
namespace {

class SessionManagerMemoryTest : public DriverTest {};

TEST_F(SessionManagerMemoryTest, RemembersTheAccessOfAReservationWhenMemoryRunsOutAfterIt) {
    SessionManager manager;
    driver.give("initializeSessionWithoutResources", std::uint64_t{1});
    manager.createSession();
    const auto session = manager.getSessionContext("_session1");
    std::optional<AllocationFault> fault;
    driver.reply("reserveDevices",
                 {{}, 0, {}, [&] { fault.emplace(0, AllocationFault::Extent::AllFromThere); }});
    manager.reserveDevices("_session1", {"Mod1"}, 3, "", 0);
    fault.reset();
    EXPECT_EQ(session->access, 3);
}

}  // namespace
}  // namespace nQITRMCWEBSVC100
