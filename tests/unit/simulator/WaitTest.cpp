#include <array>
#include <atomic>
#include <chrono>
#include <functional>
#include <future>
#include <mutex>
#include <thread>

#include "Driver.h"
#include "Result.h"

using namespace drivertest;

namespace {

constexpr double longTime = 60.0;

std::future<std::int32_t> reserveLater(Session& session, const char* devices,
                                       std::int32_t access = 3, double timeout = longTime) {
    return std::async(std::launch::async, [&session, devices, access, timeout] {
        return session.reserve(devices, access, "", timeout);
    });
}

// Returns when a call waits to write to a device that another session reads: from then on a
// reader that is ready to wait has to queue after it.
void awaitWriterInQueue(const char* device) {
    constexpr double patience = 0.05;
    Session reader;
    int inARow = 0;
    while (inARow < 3) {
        const auto start = std::chrono::steady_clock::now();
        ASSERT_EQ(reader.reserve(device, 1, "", patience), 0);
        const std::chrono::duration<double> took = std::chrono::steady_clock::now() - start;
        inARow = took.count() >= patience ? inARow + 1 : 0;
        ASSERT_EQ(reader.unreserve(device), 0);
    }
}

TEST(WaitTest, AReservationWaitsUntilTheDeviceIsFree) {
    Session holder("Mod1", 1);
    Session other;
    auto result = reserveLater(other, "Mod1");
    awaitWriterInQueue("Mod1");
    EXPECT_FALSE(isReady(result));
    holder.close();
    EXPECT_EQ(result.get(), 0);
    EXPECT_EQ(other.list("Session.ReservedDevices"), Names{"Mod1"});
}

TEST(WaitTest, AnOpeningWaitsUntilTheDeviceIsFree) {
    Session holder("Mod1", 1);
    auto opening = std::async(std::launch::async, [] {
        Status status;
        Handle handle = 0;
        nQITRMCAPI100_initializeSessionWithDevices(&handle, "Mod1", 60.0, 3, "", longTime, &status);
        Status closing;
        nQITRMCAPI100_closeSession(handle, &closing);
        return status.code;
    });
    awaitWriterInQueue("Mod1");
    EXPECT_FALSE(isReady(opening));
    EXPECT_EQ(holder.unreserve("Mod1"), 0);
    EXPECT_EQ(opening.get(), 0);
}

TEST(WaitTest, AReservationWaitsForAllItsDevices) {
    Session first("Mod1", 1);
    Session second("Mod2");
    Session other;
    auto result = reserveLater(other, "Mod1,Mod2");
    awaitWriterInQueue("Mod1");
    first.close();
    EXPECT_FALSE(isReady(result));
    second.close();
    EXPECT_EQ(result.get(), 0);
}

TEST(WaitTest, ReleasingWriteAccessAdmitsWaitingReaders) {
    Session holder("Mod1", 3);
    Session other;
    auto result = reserveLater(other, "Mod1", 1);
    EXPECT_EQ(holder.reserve("Mod1", 1), 0);
    EXPECT_EQ(result.get(), 0);
}

TEST(WaitTest, AbortEndsTheWaitsOfItsSessionOnly) {
    Session holder("Mod1,Mod2");
    Session aborted;
    Session patient;
    auto endsEarly = reserveLater(aborted, "Mod1");
    auto goesOn = reserveLater(patient, "Mod2");
    EXPECT_EQ(resultAfter(endsEarly, [&] { aborted.abort(); }), -250963);
    EXPECT_FALSE(isReady(goesOn));
    holder.close();
    EXPECT_EQ(goesOn.get(), 0);
    EXPECT_EQ(aborted.reserve("Mod1"), 0);
}

TEST(WaitTest, AbortEndsAllWaitsOfASession) {
    Session holder("Mod1,Mod2");
    Session session;
    auto first = reserveLater(session, "Mod1");
    auto second = reserveLater(session, "Mod2");
    EXPECT_EQ(resultAfter(first, [&] { session.abort(); }), -250963);
    EXPECT_EQ(resultAfter(second, [&] { session.abort(); }), -250963);
}

TEST(WaitTest, ClosingEndsTheWaitsOfTheSession) {
    Session holder("Mod1", 1);
    Session session;
    auto result = reserveLater(session, "Mod1");
    awaitWriterInQueue("Mod1");
    Status status;
    nQITRMCAPI100_closeSession(session, &status);
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(result.get(), -250955);
    session.handle = 0;
    EXPECT_EQ(holder.reserve("Mod1", 3), 0);
}

TEST(WaitTest, WaitsAreServedInTheOrderOfArrival) {
    Session holder("Mod1,Mod2,Mod4,Mod5", 1);
    // Each wants the same device, and one more that shows its arrival.
    const std::array<const char*, 3> wanted{"Mod1,Mod2", "Mod1,Mod4", "Mod1,Mod5"};
    const std::array<const char*, 3> signs{"Mod2", "Mod4", "Mod5"};
    std::mutex mutex;
    std::vector<std::size_t> order;
    std::vector<std::future<std::int32_t>> results;
    for (std::size_t i = 0; i < wanted.size(); ++i) {
        results.push_back(std::async(std::launch::async, [&, i] {
            Session session;
            const std::int32_t code = session.reserve(wanted[i], 3, "", longTime);
            const std::lock_guard<std::mutex> lock(mutex);
            order.push_back(i);
            return code;
        }));
        awaitWriterInQueue(signs[i]);
    }
    holder.close();
    for (auto& result : results) {
        EXPECT_EQ(result.get(), 0);
    }
    EXPECT_EQ(order, (std::vector<std::size_t>{0, 1, 2}));
}

// A session that wants two devices is not passed by those that want one of them.
TEST(WaitTest, ASessionThatWaitsForTwoDevicesIsNotOvertaken) {
    Session early("Mod1,Mod4", 1);
    Session late("Mod2");
    std::mutex mutex;
    std::vector<int> order;
    const auto waiter = [&](int number, const char* devices) {
        return std::async(std::launch::async, [&, number, devices] {
            Session session;
            const std::int32_t code = session.reserve(devices, 3, "", longTime);
            const std::lock_guard<std::mutex> lock(mutex);
            order.push_back(number);
            return code;
        });
    };
    auto first = waiter(1, "Mod1,Mod2");
    awaitWriterInQueue("Mod1");
    auto second = waiter(2, "Mod1,Mod4");
    awaitWriterInQueue("Mod4");
    early.close();
    late.close();
    EXPECT_EQ(first.get(), 0);
    EXPECT_EQ(second.get(), 0);
    EXPECT_EQ(order, (std::vector<int>{1, 2}));
}

TEST(WaitTest, AWaitThatTimesOutDoesNotBlockLaterOnes) {
    Session holder("Mod1", 1);
    Session marker("Mod4", 1);
    Session first;
    Session second;
    auto givesUp = reserveLater(first, "Mod1,Mod2");
    awaitWriterInQueue("Mod1");
    auto goesOn = reserveLater(second, "Mod2,Mod4");
    awaitWriterInQueue("Mod4");
    marker.close();
    EXPECT_FALSE(isReady(goesOn));
    EXPECT_EQ(resultAfter(givesUp, [&] { first.abort(); }), -250963);
    EXPECT_EQ(goesOn.get(), 0);
}

TEST(WaitTest, OtherSessionsWorkWhileOneWaits) {
    Session holder("Mod1", 1);
    Session waiting;
    auto result = reserveLater(waiting, "Mod1");
    awaitWriterInQueue("Mod1");
    Session other("Mod2");
    EXPECT_EQ(other.systemList("Sys.Devices").size(), 5u);
    EXPECT_EQ(waiting.list("Session.ReservedDevices"), Names());
    holder.close();
    EXPECT_EQ(result.get(), 0);
}

// Hundreds of sessions take turns; a device has one writer at any time.
TEST(WaitTest, ADeviceHasOneHolderAtATime) {
    constexpr int threads = 16;
    constexpr int rounds = 25;
    const std::array<const char*, 4> devices{"Mod1", "Mod2", "Mod4", "Mod5"};
    std::array<std::atomic<int>, 4> holders{};
    std::atomic<int> failures{0};
    std::vector<std::thread> workers;
    for (int worker = 0; worker < threads; ++worker) {
        workers.emplace_back([&, worker] {
            for (int round = 0; round < rounds; ++round) {
                const std::size_t index = static_cast<std::size_t>(worker + round) % devices.size();
                Status status;
                Handle handle = 0;
                nQITRMCAPI100_initializeSessionWithDevices(&handle, devices[index], 60.0, 3, "",
                                                           longTime, &status);
                failures += status.code != 0;
                failures += holders[index]++ != 0;
                holders[index]--;
                Status closing;
                nQITRMCAPI100_closeSession(handle, &closing);
                failures += closing.code != 0;
            }
        });
    }
    for (std::thread& worker : workers) {
        worker.join();
    }
    EXPECT_EQ(failures, 0);
}

TEST(WaitTest, HundredsOfThreadsWaitForOneDevice) {
    Session holder("Mod4");
    std::vector<std::future<std::int32_t>> results;
    for (int i = 0; i < 200; ++i) {
        results.push_back(std::async(std::launch::async, [] {
            Session session;
            return session.reserve("Mod4", 3, "", longTime);
        }));
    }
    holder.close();
    for (auto& result : results) {
        EXPECT_EQ(result.get(), 0);
    }
}

std::int32_t execute(Session& session, const char* resources, const char* command, double timeout) {
    Status status;
    nQITRMCAPI100_executeGenericCommand(session, resources, command, timeout, &status);
    return status.code;
}

TEST(WaitTest, AbortEndsACommandWithoutItsEffect) {
    Session session("Mod1");
    auto result = std::async(std::launch::async,
                             [&] { return execute(session, "Mod1", "DMM.Calibrate", longTime); });
    EXPECT_EQ(resultAfter(result, [&] { session.abort(); }), -250963);
    EXPECT_EQ(execute(session, "Mod1", "DMM.Trigger", 0.0), 0);
}

TEST(WaitTest, AResourceRunsOneCommandAtATime) {
    Session session("Mod1,Mod4");
    auto result = std::async(std::launch::async,
                             [&] { return execute(session, "Mod1", "DMM.Calibrate", longTime); });
    while (execute(session, "Mod1", "DMM.Trigger", 0.0) == 0) {
        std::this_thread::yield();
    }
    Status status;
    nQITRMCAPI100_executeGenericCommand(session, "Mod1", "DMM.Trigger", 0.0, &status);
    EXPECT_EQ(status.code, -250977);
    EXPECT_EQ(status.text(), detailsOf("resourceBusy", usage("ResourceName", "\"Mod1\"")));
    EXPECT_EQ(execute(session, "Mod1/ch0", "DMM.Zero", 0.0), 0);
    EXPECT_EQ(resultAfter(result, [&] { session.abort(); }), -250963);
    EXPECT_EQ(execute(session, "Mod1", "DMM.Trigger", 0.0), 0);
}

TEST(WaitTest, ClosingEndsACommand) {
    Session session("Mod1");
    auto result = std::async(std::launch::async,
                             [&] { return execute(session, "Mod1", "DMM.Calibrate", longTime); });
    while (execute(session, "Mod1", "DMM.Trigger", 0.0) == 0) {
        std::this_thread::yield();
    }
    Status status;
    nQITRMCAPI100_closeSession(session, &status);
    EXPECT_EQ(result.get(), -250955);
    session.handle = 0;
    Session next("Mod1");
    EXPECT_EQ(execute(next, "Mod1", "DMM.Trigger", 0.0), 0);
}

// Sessions read, write, rename, open and close at the same time.
TEST(WaitTest, SessionsOfAllKindsWorkConcurrently) {
    constexpr int rounds = 40;
    std::vector<std::future<int>> workers;
    const auto start = [&](const std::function<std::int32_t(Session&)>& act) {
        workers.push_back(std::async(std::launch::async, [act] {
            int failures = 0;
            for (int round = 0; round < rounds; ++round) {
                Session session;
                failures += act(session) < 0;
            }
            return failures;
        }));
    };
    for (int copy = 0; copy < 2; ++copy) {
        start([](Session& session) {
            Status status;
            double value = 0;
            nQITRMCAPI100_getGenericPropertyDouble(session, "Mod2/ch0", "PSU.Voltage", &value,
                                                   &status);
            return status.code;
        });
        start([](Session& session) {
            Status status;
            nQITRMCAPI100_setGenericPropertyDouble(session, "Mod2/ch0", "PSU.Voltage", 1.0,
                                                   &status);
            return status.code;
        });
        start([](Session& session) {
            return execute(session, "Mod4", "DIG.SelfTest", 0.0) + 250976;
        });
        start([](Session& session) {
            Status status;
            nQITRMCAPI100_writeRegisterUInt32(session, "Mod1", 256, 1, &status);
            nQITRMCAPI100_setNvmemBytes(session, "Mod1/user", 0, nullptr, 0, "", "", &status);
            return status.code;
        });
        start([](Session& session) {
            return static_cast<std::int32_t>(session.deviceList("Mod1", "Dev.PhysChans").size()) -
                   4;
        });
        start([](Session& session) {
            Status status;
            nQITRMCAPI100_renameDevice(session, "Mod5", "MOD5", &status);
            return status.code;
        });
    }
    for (auto& worker : workers) {
        EXPECT_EQ(worker.get(), 0);
    }
    Session session;
    Status status;
    nQITRMCAPI100_renameDevice(session, "Mod5", "Mod5", &status);
}

}  // namespace
