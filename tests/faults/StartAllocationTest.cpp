#include <new>
#include <optional>

#include "ServiceTest.h"
#include "support/allocationFaults.h"
#include "support/sanitizers.h"
#include "support/series.h"

#if defined(QITRMC_ADDRESS_SANITIZER)
#include <sanitizer/lsan_interface.h>
#endif

namespace {

const std::vector<std::string> disabled = {
    "code 404", "write QI-TRMC web server is disabled. Please enable it in QI-DESK."};

class StartAllocationTest : public ServiceTest,
                            public testing::WithParamInterface<AllocationFault::Extent> {
  protected:
    enum class Start { Done, OutOfMemory };

    // Initialises with one fault. Returns how that ended if the fault was reached.
    std::optional<Start> startWithFault(int successes) {
#if defined(QITRMC_ADDRESS_SANITIZER)
        // The JSON library leaks what it has compiled so far when memory for the rest of a schema
        // runs out. That can happen only at the start.
        __lsan::ScopedDisabler expected;
#endif
        AllocationFault fault(successes, GetParam());
        Start start = Start::Done;
        try {
            qitrmcInit();
        } catch (const std::bad_alloc&) {
            start = Start::OutOfMemory;
        }
        return fault.hasStruck() ? std::make_optional(start) : std::nullopt;
    }

    // The next allocation to fail. The validators of all methods are built alike, so the later
    // allocations are tried at increasing intervals.
    static int after(int successes) { return successes + failureStep * (1 + successes / 50); }

    const std::string open = call("initializeSession", "{}");
};

TEST_P(StartAllocationTest, FailsWhenMemoryRunsOutAndCanBeRepeated) {
    int tried = 0;
    for (int successes = 0;; successes = after(successes)) {
        SCOPED_TRACE("allocation " + std::to_string(successes + 1));
        qitrmcFinalize();
        const std::optional<Start> start = startWithFault(successes);
        if (!start) {
            break;
        }
        ++tried;
        // When memory for the configuration runs out, the service stays disabled. Without a handler
        // it cannot respond, but must not crash.
        if (*start == Start::OutOfMemory) {
            EXPECT_EQ(outcomesOfPost(open), Outcomes{httpServerError});
        } else {
            EXPECT_EQ(post(open), disabled);
        }
        qitrmcInit();
        expectSoundService();
        ASSERT_FALSE(HasFailure());
    }
    EXPECT_GT(tried, 0);
    RecordProperty("allocations", tried);
}

TEST_P(StartAllocationTest, IsEnabledBeforeItHasAHandler) {
    const std::string configuration = "/etc/qinstal/share/qitrmc.ini";
    qitrmcFinalize();
    root.write(configuration, "[WebService]\nEnable=0\n");
    qitrmcInit();
    ASSERT_EQ(post(open), disabled);
    root.write(configuration, "[WebService]\nEnable=1\n");
    // The configuration takes fewer allocations than this, the handler many more.
    ASSERT_EQ(startWithFault(200), Start::OutOfMemory);
    EXPECT_EQ(outcomesOfPost(open), Outcomes{httpServerError});
    qitrmcInit();
    expectSoundService();
}

TEST_P(StartAllocationTest, KeepsTheRunningHandlerWhenThereIsNoMemoryForANewOne) {
    EXPECT_EQ(outcomesOfPost(open), Outcomes{0});
    // The configuration takes fewer allocations than this, the handler many more.
    ASSERT_EQ(startWithFault(200), Start::OutOfMemory);
    EXPECT_EQ(outcomesOfPost(callFor("closeSession", sessions.opened())), Outcomes{0});
    expectSoundService();
}

INSTANTIATE_TEST_SUITE_P(Faults, StartAllocationTest,
                         testing::Values(AllocationFault::Extent::One,
                                         AllocationFault::Extent::AllFromThere),
                         [](const auto& info) {
                             return info.param == AllocationFault::Extent::One ? "OneFails"
                                                                               : "AllFailFromThere";
                         });

}  // namespace
