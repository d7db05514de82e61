// Kills processes at random moments while they commit. The environment variable QITRMC_KILLS sets
// how often; the default is 50 times.

#include <signal.h>

#include <chrono>
#include <random>
#include <thread>

#include "StateFolder.h"

using namespace drivertest;

namespace {

constexpr std::uint32_t areaSize = 65536;

// Two areas on two devices, large enough that writing them takes a while.
constexpr const char* twoDevices = R"({"devices": [
    {"name": "A", "category": 2, "nvmem_areas": [{"name": "user", "size": 65536}]},
    {"name": "B", "category": 2, "nvmem_areas": [{"name": "user", "size": 65536}]}
]})";

// The content of an area in a round: the number of the round, repeated.
Bytes contentOfRound(std::uint32_t round) {
    Bytes bytes;
    for (std::uint32_t i = 0; i < areaSize / 4; ++i) {
        for (std::uint32_t shift = 0; shift < 32; shift += 8) {
            bytes.push_back(static_cast<std::uint8_t>(round >> shift));
        }
    }
    return bytes;
}

std::uint32_t roundOf(const Bytes& bytes) {
    return bytes[0] | std::uint32_t{bytes[1]} << 8 | std::uint32_t{bytes[2]} << 16 |
           std::uint32_t{bytes[3]} << 24;
}

// Commits one round after the other to both areas at once, and writes the number of each to the
// pipe: first the one that it finds, then each that was committed.
void commitForEver(int pipe) {
    Session session("A,B");
    const Bytes found = readArea(session, "A/user", areaSize);
    std::uint32_t round = roundOf(found);
    // A torn or mixed content is reported as an impossible round.
    if (found != contentOfRound(round) || readArea(session, "B/user", areaSize) != found) {
        round = UINT32_MAX;
    }
    while (::write(pipe, &round, sizeof round) == sizeof round) {
        ++round;
        const Bytes content = contentOfRound(round);
        if (writeArea(session, "A/user", content).code != 0 ||
            writeArea(session, "B/user", content).code != 0 ||
            commitNvmem(session, "A/user,B/user").code != 0) {
            return;
        }
    }
}

// What a process reported before it was killed.
struct Report {
    std::uint32_t found = UINT32_MAX;
    std::uint32_t committed = UINT32_MAX;
};

// Kills a process some time after it started, or after its first commit.
Report killSoon(const StateFolder& state, bool mayCommit, std::chrono::microseconds delay) {
    int ends[2];
    EXPECT_EQ(pipe(ends), 0);
    const pid_t child = state.start([&] {
        close(ends[0]);
        commitForEver(ends[1]);
    });
    close(ends[1]);
    Report report;
    EXPECT_EQ(::read(ends[0], &report.found, sizeof report.found), ssize_t{sizeof report.found});
    report.committed = report.found;
    if (mayCommit) {
        EXPECT_GT(::read(ends[0], &report.committed, sizeof report.committed), 0);
    }
    // No condition is awaited here: the delay determines the moment of the kill.
    std::this_thread::sleep_for(delay);
    kill(child, SIGKILL);
    while (::read(ends[0], &report.committed, sizeof report.committed) > 0) {
    }
    close(ends[0]);
    int result = 0;
    EXPECT_EQ(waitpid(child, &result, 0), child);
    EXPECT_TRUE(WIFSIGNALED(result));
    return report;
}

TEST(StateKillTest, AKilledProcessLeavesACompleteContentNotOlderThanItsLastCommit) {
    const char* wanted = std::getenv("QITRMC_KILLS");
    const int kills = wanted != nullptr ? std::atoi(wanted) : 50;
    const ChassisFile file(twoDevices);
    StateFolder state;
    state.chassis = file.path;
    std::mt19937 random(testing::UnitTest::GetInstance()->random_seed());
    std::uniform_int_distribution<int> microseconds(0, 10000);
    std::uint32_t committed = 0;
    int cutOff = 0;
    int unacknowledged = 0;
    for (int i = 0; i < kills; ++i) {
        const Report report =
            killSoon(state, i % 2 == 1, std::chrono::microseconds(microseconds(random)));
        ASSERT_GE(report.found, committed) << "kill " << i;
        ASSERT_LE(report.found, committed + 1) << "kill " << i;
        unacknowledged += report.found == committed + 1 ? 1 : 0;
        committed = report.committed;
        cutOff += std::filesystem::exists(state.file("unfinished")) ? 1 : 0;
    }
    std::printf(
        "%d kills, %u commits; %d kills while a file was written, %d after it was there "
        "and before the commit returned\n",
        kills, static_cast<unsigned>(committed), cutOff, unacknowledged);
    EXPECT_GE(committed, static_cast<std::uint32_t>(kills / 2));
}

}  // namespace
