#include "host/Connections.h"

#include <gtest/gtest.h>
#include <poll.h>
#include <sys/socket.h>
#include <unistd.h>

#include <chrono>
#include <functional>
#include <future>

namespace {

using host::Connection;
using host::Connections;

constexpr std::chrono::milliseconds moment(20);

// Two connected sockets: the host's and its client's.
class Pair {
  public:
    Pair() { socketpair(AF_UNIX, SOCK_STREAM, 0, ends); }
    ~Pair() {
        close(ends[0]);
        close(ends[1]);
    }
    int host() const { return ends[0]; }

    // Whether the client sees the end of the connection within moment.
    bool isShut() const {
        pollfd client = {ends[1], POLLIN, 0};
        return poll(&client, 1, static_cast<int>(moment.count())) == 1;
    }

  private:
    int ends[2] = {-1, -1};
};

using Clock = std::chrono::steady_clock;

// Closes overdue connections, as the host does all the time, until `condition` holds. Returns how
// many seconds that took since `begin`.
double shutOverdueUntil(Connections& connections, const std::function<bool()>& condition,
                        Clock::time_point begin = Clock::now()) {
    const Clock::time_point giveUp = begin + std::chrono::minutes(1);
    while (!condition() && Clock::now() < giveUp) {
        connections.shutOverdue();
    }
    EXPECT_TRUE(condition());
    return std::chrono::duration<double>(Clock::now() - begin).count();
}

TEST(Connections, CloseAConnectionThatIsIdleLongerThanTheTimeout) {
    const Pair pair;
    Connections connections(10, 1);
    const Clock::time_point begin = Clock::now();
    connections.add(pair.host());
    connections.shutOverdue();
    EXPECT_FALSE(pair.isShut());
    const double seconds = shutOverdueUntil(
        connections, [&] { return pair.isShut(); }, begin);
    EXPECT_GE(seconds, 1.0);
}

TEST(Connections, DoNotCloseAConnectionWhoseRequestIsBeingProcessed) {
    const Pair working;
    const Pair waiting;
    Connections connections(10, 1);
    connections.add(working.host())->workForClient();
    connections.add(waiting.host());
    shutOverdueUntil(connections, [&] { return waiting.isShut(); });
    EXPECT_FALSE(working.isShut());
}

TEST(Connections, MeasureTheTimeoutFromTheLastActivity) {
    const Pair first;
    const Pair second;
    Connections connections(10, 1);
    connections.add(first.host());
    Connection* patient = connections.add(second.host());
    shutOverdueUntil(connections, [&] {
        patient->waitForClient();
        return first.isShut();
    });
    EXPECT_FALSE(second.isShut());
}

TEST(Connections, CloseAnIdleConnectionSoonerWhenAllSlotsAreTaken) {
    const Pair first;
    const Pair second;
    Connections connections(2, 86400);
    const Clock::time_point begin = Clock::now();
    connections.add(first.host());
    connections.add(second.host())->workForClient();
    const double seconds = shutOverdueUntil(
        connections, [&] { return first.isShut(); }, begin);
    EXPECT_GE(seconds, 2.0);
    EXPECT_FALSE(second.isShut());
}

TEST(Connections, HaveAFreeSlotUntilTheLimitIsReached) {
    const Pair first;
    const Pair second;
    Connections connections(2, 1);
    connections.add(first.host());
    EXPECT_TRUE(connections.waitForPlace());
    Connection* last = connections.add(second.host());
    std::future<bool> place =
        std::async(std::launch::async, [&] { return connections.waitForPlace(); });
    EXPECT_EQ(place.wait_for(moment), std::future_status::timeout);
    connections.remove(last);
    EXPECT_TRUE(place.get());
}

TEST(Connections, AreEmptyOnceTheLastIsRemoved) {
    const Pair pair;
    Connections connections(10, 1);
    connections.waitUntilEmpty();
    Connection* last = connections.add(pair.host());
    std::future<void> empty = std::async(std::launch::async, [&] { connections.waitUntilEmpty(); });
    EXPECT_EQ(empty.wait_for(moment), std::future_status::timeout);
    connections.remove(last);
    empty.get();
}

TEST(Connections, ShutEachConnectionAtTheEnd) {
    const Pair working;
    const Pair waiting;
    Connections connections(10, 1);
    connections.add(working.host())->workForClient();
    connections.add(waiting.host());
    connections.shutAll();
    EXPECT_TRUE(working.isShut());
    EXPECT_TRUE(waiting.isShut());
}

TEST(Connections, EndTheWaitForASlotWhenTheyAreClosed) {
    const Pair pair;
    Connections connections(1, 1);
    connections.add(pair.host());
    std::future<bool> place =
        std::async(std::launch::async, [&] { return connections.waitForPlace(); });
    connections.close();
    EXPECT_FALSE(place.get());
}

TEST(Connections, ForgetAConnectionThatIsRemoved) {
    const Pair removed;
    const Pair other;
    Connections connections(2, 1);
    connections.remove(connections.add(removed.host()));
    connections.add(other.host());
    shutOverdueUntil(connections, [&] { return other.isShut(); });
    EXPECT_FALSE(removed.isShut());
    connections.remove(nullptr);
}

}  // namespace
