#include "host/Gate.h"

#include <gtest/gtest.h>

#include <atomic>
#include <thread>

namespace {

using host::Gate;
using std::chrono::milliseconds;
using std::chrono::minutes;

TEST(Gate, IsEmptyUntilARequestEnters) {
    Gate gate;
    EXPECT_TRUE(gate.waitUntilEmpty(milliseconds(0)));
    EXPECT_TRUE(gate.enter());
    EXPECT_FALSE(gate.waitUntilEmpty(milliseconds(0)));
    gate.leave();
    EXPECT_TRUE(gate.waitUntilEmpty(milliseconds(0)));
}

TEST(Gate, RefusesRequestsOnceItIsClosed) {
    Gate gate;
    EXPECT_FALSE(gate.isClosed());
    EXPECT_TRUE(gate.enter());
    gate.close();
    EXPECT_TRUE(gate.isClosed());
    EXPECT_FALSE(gate.enter());
    gate.leave();
    EXPECT_TRUE(gate.waitUntilEmpty(milliseconds(0)));
}

// Closing and entering concurrently must not be a data race, which the thread sanitizer reports.
TEST(Gate, ClosesWhileRequestsEnter) {
    Gate gate;
    std::atomic<bool> entered{false};
    std::thread requests([&] {
        while (gate.enter()) {
            gate.leave();
            entered.store(true, std::memory_order_relaxed);
        }
    });
    while (!entered.load(std::memory_order_relaxed)) {
        std::this_thread::yield();
    }
    gate.close();
    requests.join();
    EXPECT_TRUE(gate.waitUntilEmpty(milliseconds(0)));
}

TEST(Gate, WakesTheWaiterWhenTheLastRequestLeaves) {
    Gate gate;
    gate.enter();
    gate.enter();
    gate.close();
    std::thread requests([&] {
        gate.leave();
        gate.leave();
    });
    EXPECT_TRUE(gate.waitUntilEmpty(minutes(1)));
    requests.join();
}

}  // namespace
