// Faults while calls wait, and faults that change while many threads call.

#include <atomic>
#include <chrono>
#include <functional>
#include <future>
#include <thread>

#include "FaultsInForce.h"
#include "Result.h"
#include "Values.h"

using namespace drivertest;

namespace {

constexpr std::int32_t deviceRemoved = -250940;
constexpr std::int32_t connectionLost = -250941;
constexpr std::int32_t aborted = -250963;
constexpr std::int32_t unknownSession = -250955;

Result later(std::function<std::int32_t()> call) {
    return std::async(std::launch::async, std::move(call));
}

std::int32_t readTemperature(Handle session, const char* device) {
    return get(getDouble, session, device, "Dev.Temperature").code;
}

std::int32_t execute(Handle session, const char* resource, const char* command) {
    Status status;
    nQITRMCAPI100_executeGenericCommand(session, resource, command, 60.0, &status);
    return status.code;
}

std::string event(const char* device, const std::string& members) {
    return "{\"events\":[{\"device\":\"" + std::string(device) + "\",\"event\":" + members + "}]}";
}

const std::string longDelay = oneFault("\"function\":\"getGeneric*\",\"delay\":3600");

TEST(FaultWaitTest, ADelayTakesItsTime) {
    Session session;
    const FaultsInForce faults(oneFault("\"function\":\"getGeneric*\",\"delay\":0.05"));
    const auto start = std::chrono::steady_clock::now();
    EXPECT_EQ(readTemperature(session, "Mod1"), 0);
    EXPECT_GE(std::chrono::steady_clock::now() - start, std::chrono::milliseconds(50));
}

TEST(FaultWaitTest, AFailureComesAfterItsDelay) {
    Session session;
    const FaultsInForce faults(
        oneFault("\"function\":\"getGeneric*\",\"delay\":0.05,\"status\":{\"code\":-77}"));
    const auto start = std::chrono::steady_clock::now();
    EXPECT_EQ(readTemperature(session, "Mod1"), -77);
    EXPECT_GE(std::chrono::steady_clock::now() - start, std::chrono::milliseconds(50));
}

TEST(FaultWaitTest, AnAbortEndsADelay) {
    Session session;
    const FaultsInForce faults(longDelay);
    Result reading = later([&] { return readTemperature(session, "Mod1"); });
    EXPECT_EQ(resultAfter(reading, [&] { EXPECT_EQ(session.abort(), 0); }), aborted);
}

TEST(FaultWaitTest, ClosingTheSessionEndsADelay) {
    Session session;
    const Handle handle = session;
    const FaultsInForce faults(longDelay);
    std::atomic<bool> began{false};
    Result reading = later([&] {
        began = true;
        return readTemperature(handle, "Mod1");
    });
    while (!began) {
        std::this_thread::yield();
    }
    EXPECT_EQ(session.close(), 0);
    EXPECT_EQ(reading.get(), unknownSession);
}

TEST(FaultWaitTest, OtherFaultsEndADelay) {
    FaultsInForce faults(oneFault("\"function\":\"initialize*\",\"delay\":3600"));
    std::atomic<bool> began{false};
    Result opening = later([&] {
        began = true;
        const Session session;
        return std::int32_t{0};
    });
    while (!began) {
        std::this_thread::yield();
    }
    EXPECT_EQ(resultAfter(opening, [&] { faults.replace("{}"); }), 0);
}

TEST(FaultWaitTest, ACallOnAClosedSessionIsNotDelayed) {
    Session session;
    const Handle handle = session;
    ASSERT_EQ(session.close(), 0);
    const FaultsInForce faults(longDelay);
    EXPECT_EQ(readTemperature(handle, "Mod1"), unknownSession);
}

TEST(FaultWaitTest, ADelayDoesNotBlockOtherCalls) {
    Session session;
    Session other;
    const FaultsInForce faults(
        oneFault("\"function\":\"getGeneric*\",\"resource\":\"Mod1\",\"delay\":3600"));
    Result reading = later([&] { return readTemperature(session, "Mod1"); });
    EXPECT_EQ(readTemperature(other, "Mod2"), 0);
    EXPECT_EQ(resultAfter(reading, [&] { session.abort(); }), aborted);
}

TEST(FaultWaitTest, AFaultThatIsReplacedDuringItsDelayStillApplies) {
    Session session;
    FaultsInForce faults(
        oneFault("\"function\":\"getGeneric*\",\"delay\":0.05,\"status\":{\"code\":-77}"));
    std::atomic<bool> isThrough{false};
    Result reading = later([&] {
        const std::int32_t code = readTemperature(session, "Mod1");
        isThrough = true;
        return code;
    });
    // The call may not have begun yet: then an equal fault of the new plan applies to it.
    while (!isThrough) {
        faults.replace(oneFault("\"function\":\"getGeneric*\",\"status\":{\"code\":-77}"));
    }
    EXPECT_EQ(reading.get(), -77);
}

TEST(FaultWaitTest, ACommandEndsWhenItsModuleIsRemoved) {
    Session session("Mod1");
    Result command = later([&] { return execute(session, "Mod1", "DMM.Calibrate"); });
    FaultsInForce faults("{}");
    EXPECT_EQ(resultAfter(command, [&] { faults.replace(event("Mod1", "\"pulled\"")); }),
              deviceRemoved);
    faults.replace("{}");
    EXPECT_EQ(execute(session, "Mod1", "DMM.Trigger"), 0);
    EXPECT_EQ(resetDevices(session, "Mod1"), 0);
}

TEST(FaultWaitTest, ACommandEndsAtTheTimeOfAnEvent) {
    Session session("Mod1");
    const FaultsInForce faults(event("Mod1", "\"pulled\",\"after\":0.05"));
    EXPECT_EQ(execute(session, "Mod1", "DMM.Calibrate"), deviceRemoved);
}

TEST(FaultWaitTest, ACommandContinuesWhenAnotherModuleIsRemoved) {
    Session session("Mod1");
    const FaultsInForce faults(event("Mod2", "\"pulled\",\"after\":0.01"));
    EXPECT_EQ(execute(session, "Mod1", "DMM.SelfTest"), 0);
}

TEST(FaultWaitTest, AReservationEndsWhenItsDeviceIsLost) {
    Session holder("Mod1");
    Session other;
    Result waiting = later([&] { return other.reserve("Mod1,Mod2", 3, "", 60.0); });
    FaultsInForce faults("{}");
    EXPECT_EQ(resultAfter(waiting, [&] { faults.replace(event("Mod1", "\"connection_lost\"")); }),
              connectionLost);
    EXPECT_EQ(other.list("Session.ReservedDevices"), Names{});
}

TEST(FaultWaitTest, AnEventThatIsSetDuringAWaitEndsIt) {
    Session holder("Mod1");
    Session other;
    Result waiting = later([&] { return other.reserve("Mod1", 3, "", 60.0); });
    const FaultsInForce faults(event("Mod1", "\"pulled\",\"after\":0.02"));
    EXPECT_EQ(waiting.get(), deviceRemoved);
}

// Many clients of all kinds while the faults change: nothing may leak, and nothing may be read that
// was never set. To be run with the thread sanitizer.
TEST(FaultWaitTest, FaultsMayChangeWhileManyThreadsCall) {
    const std::string plans[] = {
        "{}",
        oneFault("\"status\":{\"code\":-77},\"probability\":0.5"),
        oneFault("\"function\":\"get*\",\"output\":{\"count\":3}"),
        oneFault("\"function\":\"get*\",\"output\":{\"null\":true},\"status\":{\"code\":77}"),
        oneFault("\"delay\":0.001,\"resource\":\"Mod2\""),
        event("Mod2", "\"pulled\",\"lasts\":0.001"),
        event("Mod2", "\"connection_lost\""),
    };
    constexpr int count = 6;
    std::atomic<int> opened{0};
    std::atomic<bool> isEnough{false};
    std::vector<std::thread> threads;
    for (int i = 0; i < count; ++i) {
        threads.emplace_back([&] {
            Session session;
            ++opened;
            while (!isEnough) {
                for (const char* device : {"Mod1", "Mod2"}) {
                    const auto label = getText(session, device, "Dev.ProductName");
                    EXPECT_TRUE(label.code != 0 || label.value == "Multimeter" ||
                                label.value == "Power supply")
                        << label;
                    session.reserve(device, 3, "group");
                    execute(session, device, "DMM.SelfTest");
                    session.unreserve(device);
                }
                session.abort();
            }
            // A fault may prevent the session from being closed by its destructor.
            FaultsInForce("{}");
        });
    }
    // A fault in force could prevent a session from being opened.
    while (opened < count) {
        std::this_thread::yield();
    }
    for (int round = 0; round < 200; ++round) {
        EXPECT_EQ(setFaults(plans[round % 7]).code, 0);
        std::this_thread::yield();
    }
    EXPECT_EQ(setFaults("{}").code, 0);
    isEnough = true;
    for (std::thread& thread : threads) {
        thread.join();
    }
    Session session("Mod1,Mod2");
    EXPECT_EQ(resetDevices(session, "Mod1,Mod2"), 0);
}

}  // namespace
