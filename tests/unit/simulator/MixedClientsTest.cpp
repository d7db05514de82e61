#include <algorithm>
#include <array>
#include <atomic>
#include <filesystem>
#include <random>
#include <thread>

#include "ChassisFile.h"
#include "FaultsInForce.h"
#include "Values.h"

using namespace drivertest;

// Many clients at once, on a chassis that keeps state, moves, is traced, and fails.
namespace {

constexpr int clients = 6;
// Each client does so many, and goes on until every kind that counts has succeeded.
constexpr int operations = 250;
constexpr int mostOperations = 400 * operations;
constexpr std::size_t operationKinds = 9;
// Those that leave their status: writing, commands, connecting, resetting, renaming.
constexpr std::array<std::size_t, 5> countedKinds{2, 3, 4, 5, 7};
constexpr std::int32_t faultCode = -77;
constexpr std::int32_t faultWarning = 77;
constexpr std::int32_t aborted = -250963;
constexpr std::uint32_t areaBytes = 16;
const std::array<const char*, 4> modules{"Mod1", "Mod2", "Mod4", "Mod5"};
const std::array<const char*, 3> selfTests{"DMM.SelfTest", "PSU.SelfTest", "DIG.SelfTest"};

const std::array<const char*, 7> faultPlans{
    R"({"faults": [{"probability": 0.05, "status": {"code": -77}}]})",
    R"({"faults": [{"function": "get*", "probability": 0.2, "output": {"null": true}}]})",
    R"({"faults": [{"function": "get*", "output": {"count": 300, "text_size": 30}}]})",
    R"({"faults": [{"delay": 0.2, "probability": 0.3, "status": {"code": 77}}]})",
    R"({"faults": [{"probability": 0.1, "moment": "after", "status": {"code": -77}}]})",
    R"({"events": [{"device": "Mod2", "event": "pulled", "lasts": 1},
                   {"device": "Mod4", "event": "connection_lost", "after": 0.5}]})",
    "{}"};

// The state that the clients share.
struct Bench {
    // Sessions that any client may use, abort and close; 0 for none.
    std::array<std::atomic<Handle>, 8> sessions{};
    // How often each kind of operation on a shared session succeeded.
    std::array<std::atomic<int>, operationKinds> successes{};
    bool eachKindSucceeded() const {
        return std::all_of(countedKinds.begin(), countedKinds.end(),
                           [&](std::size_t kind) { return successes[kind] > 0; });
    }
    // How many clients have exclusive access to each module.
    std::array<std::atomic<int>, 4> owners{};
};

class Client {
  public:
    Client(Bench& bench, unsigned seed) : bench(bench), random(seed) {}

    void run() {
        for (int i = 0; i < operations || (i < mostOperations && !bench.eachKindSucceeded()); ++i) {
            switch (below(8)) {
                case 0:
                    openShared();
                    break;
                case 1:
                    disturbShared();
                    break;
                case 2:
                case 3:
                    useExclusively();
                    break;
                default:
                    useShared();
            }
        }
    }

  private:
    std::size_t below(std::size_t end) { return random() % end; }
    std::atomic<Handle>& anyShared() { return bench.sessions[below(bench.sessions.size())]; }
    const char* anyModule() { return modules[below(modules.size())]; }

    // Every code must be one that the driver defines, or that a fault has set.
    static void expectSound(const Status& status) {
        const bool isKnown = status.code >= -250990 && status.code <= -250811;
        const bool isWarning = status.code == 250990 || status.code == 250991;
        EXPECT_TRUE(isKnown || isWarning || status.code == 0 || status.code == faultCode ||
                    status.code == faultWarning)
            << status.code;
        EXPECT_NE(status.code, -250951) << status.text();
    }

    // Repeats until the session is closed, because faults keep sessions open, and so does another
    // client that aborts a delayed close.
    static void close(Handle session) {
        std::int32_t code = faultCode;
        while (code == faultCode || code == aborted) {
            Status status;
            nQITRMCAPI100_closeSession(session, &status);
            expectSound(status);
            code = status.code;
        }
    }

    void openShared() {
        Status status;
        Handle session = 0;
        nQITRMCAPI100_initializeSessionWithDevices(&session, anyModule(), 60.0, 1 + 2 * below(2),
                                                   below(2) == 0 ? "" : "friends", 5.0, &status);
        expectSound(status);
        EXPECT_EQ(session != 0, status.code >= 0);
        if (const Handle former = anyShared().exchange(session)) {
            close(former);
        }
    }

    void disturbShared() {
        std::atomic<Handle>& place = anyShared();
        if (below(2) == 0) {
            Status status;
            nQITRMCAPI100_abortSession(place, &status);
            expectSound(status);
        } else if (const Handle session = place.exchange(0)) {
            close(session);
            openShared();
        }
    }

    void useShared() {
        const Handle session = anyShared();
        Status status;
        const std::size_t operation = below(operationKinds);
        switch (operation) {
            case 0:
                readText(session);
                break;
            case 1:
                readRecord(session);
                break;
            case 2:
                nQITRMCAPI100_setGenericPropertyDouble(session, "Mod2/ch0", "PSU.Voltage",
                                                       static_cast<double>(below(30)), &status);
                break;
            case 3: {
                const std::size_t module = below(3);
                nQITRMCAPI100_executeGenericCommand(session, modules[module], selfTests[module],
                                                    1.0, &status);
                break;
            }
            case 4:
                nQITRMCAPI100_connectToDevices(session, anyModule(), 1.0, &status);
                break;
            case 5:
                nQITRMCAPI100_resetDevices(session, anyModule(), &status);
                break;
            case 6:
                readAttribute(session);
                break;
            case 7:
                rename(session, status);
                break;
            default:
                readArea(session);
        }
        expectSound(status);
        bench.successes[operation] += status.code == 0 ? 1 : 0;
    }

    // Back and forth, whatever the name is now.
    void rename(Handle session, Status& status) {
        const bool there = below(2) == 0;
        nQITRMCAPI100_renameDevice(session, there ? "Mod5" : "Switch", there ? "Switch" : "Mod5",
                                   &status);
    }

    static void readText(Handle session) {
        const auto answer = getText(session, "Mod1", "Dev.ProductName");
        EXPECT_TRUE(answer.code >= 0 || answer.value.empty());
    }

    static void readRecord(Handle session) {
        Status status;
        double* samples = nullptr;
        std::uint32_t count = 0;
        nQITRMCAPI100_getGenericPropertyDoubleArray(session, "Mod4/ch0", "DIG.Waveform", &samples,
                                                    &count, &status);
        expectSound(status);
        EXPECT_TRUE(status.code >= 0 || (samples == nullptr && count == 0));
        nQITRMCAPI100_freeArray(samples);
    }

    // What a fault keeps open is closed with its session.
    static void readAttribute(Handle session) {
        Status status;
        nQITRMCAPI100_Property property = 0;
        char* unit = nullptr;
        nQITRMCAPI100_openGenericProperty(session, "Mod1", "DMM.Range", &property, &status);
        nQITRMCAPI100_getPropertyPropertyString(property, "Prop.Unit", &unit, &status);
        expectSound(status);
        nQITRMCAPI100_freeString(unit);
        if (property != 0) {
            Status closing;
            nQITRMCAPI100_closeProperty(property, &closing);
            expectSound(closing);
        }
    }

    // The bytes of an area are written together, so they are read together.
    static void readArea(Handle session) {
        Status status;
        std::array<std::uint8_t, areaBytes> bytes{};
        nQITRMCAPI100_getNvmemBytes(session, "Mod1/user", 0, bytes.data(), areaBytes, &status);
        expectSound(status);
        EXPECT_EQ(std::vector<std::uint8_t>(bytes.begin(), bytes.end()),
                  std::vector<std::uint8_t>(areaBytes, bytes[0]));
    }

    // On a session that no other client uses.
    void useExclusively() {
        Status opening;
        Handle session = 0;
        nQITRMCAPI100_initializeSessionWithoutResources(&session, &opening);
        expectSound(opening);
        if (session == 0) {
            return;
        }
        const std::size_t module = below(2);
        Status status;
        nQITRMCAPI100_reserveDevices(session, modules[module], 3, "", 5.0, &status);
        expectSound(status);
        if (status.code == 0) {
            EXPECT_EQ(++bench.owners[module], 1);
            writeArea(session);
            --bench.owners[module];
        }
        close(session);
    }

    void writeArea(Handle session) {
        const std::vector<std::uint8_t> bytes(areaBytes, static_cast<std::uint8_t>(below(256)));
        Status status;
        nQITRMCAPI100_setNvmemBytes(session, "Mod1/user", 0, bytes.data(), areaBytes, "", "",
                                    &status);
        if (below(4) == 0) {
            nQITRMCAPI100_commitNvmemGeneric(session, "Mod1/user", &status);
        }
        expectSound(status);
    }

    Bench& bench;
    std::mt19937 random;
};

// Changes the faults while clients are at work.
void changeFaults(const std::atomic<int>& atWork) {
    for (std::size_t i = 0; atWork > 0; ++i) {
        EXPECT_EQ(qitrmcsim_setFaults(faultPlans[i % faultPlans.size()], nullptr), 0);
        std::this_thread::yield();
    }
    EXPECT_EQ(qitrmcsim_setFaults("{}", nullptr), 0);
}

class TemporaryFolder {
  public:
    TemporaryFolder() : path(mkdtemp(pattern.data())) {}
    TemporaryFolder(const TemporaryFolder&) = delete;
    TemporaryFolder& operator=(const TemporaryFolder&) = delete;
    ~TemporaryFolder() { std::filesystem::remove_all(path); }

  private:
    std::string pattern = "/tmp/mixed-clientsXXXXXX";

  public:
    const std::string path;
};

void expectNothingOutstanding() {
    qitrmcsim_Outstanding counts;
    qitrmcsim_countOutstanding(&counts);
    EXPECT_EQ(counts.texts, 0u);
    EXPECT_EQ(counts.numberArrays, 0u);
    EXPECT_EQ(counts.textArrays, 0u);
    EXPECT_EQ(counts.openProperties, 0u);
    EXPECT_EQ(counts.openCommands, 0u);
    EXPECT_EQ(counts.sessions, 0u);
}

TEST(MixedClientsTest, LeaveNothingOpenAndNeverShareAnExclusiveDevice) {
    const TemporaryFolder folder;
    setenv("QITRMC_SIM_STATE", (folder.path + "/state").c_str(), 1);
    setenv("QITRMC_SIM_TRACE", (folder.path + "/trace").c_str(), 1);
    setenv("QITRMC_SIM_TIME_SCALE", "1000", 1);
    testing::internal::CaptureStderr();
    Bench bench;
    std::atomic<int> atWork{clients};
    std::vector<std::thread> threads;
    for (int i = 0; i < clients; ++i) {
        threads.emplace_back([&bench, &atWork, i] {
            Client(bench, static_cast<unsigned>(i)).run();
            --atWork;
        });
    }
    changeFaults(atWork);
    for (std::thread& thread : threads) {
        thread.join();
    }
    for (const auto& session : bench.sessions) {
        Status status;
        nQITRMCAPI100_closeSession(session, &status);
    }
    expectNothingOutstanding();
    for (const std::size_t kind : countedKinds) {
        EXPECT_GT(bench.successes[kind], 0) << "operation " << kind;
    }
    Status renaming;
    const Session any;
    nQITRMCAPI100_renameDevice(any, "Switch", "Mod5", &renaming);
    const Session all("Bench,Mod1,Mod2,Mod4,Mod5");
    EXPECT_EQ(get(getDouble, all, "Mod1", "DMM.Range").code, 0);
    EXPECT_EQ(testing::internal::GetCapturedStderr(), "");
}

}  // namespace
