#include <algorithm>
#include <atomic>
#include <chrono>
#include <thread>

#include "Values.h"
#include "qitrmcsim.h"
#include "support/series.h"

using namespace drivertest;

namespace {

using Real = std::chrono::steady_clock;

// A record that takes far longer to read than a thread may have to wait for a processor.
constexpr std::uint32_t recordLength = isEmulated ? 100000 : 1000000;

qitrmcsim_Outstanding outstanding() {
    qitrmcsim_Outstanding counts;
    qitrmcsim_countOutstanding(&counts);
    return counts;
}

// Reads a temperature until its end, and measures the longest call.
class Reader {
  public:
    Reader()
        : thread([this] {
              while (!stopped) {
                  const auto start = Real::now();
                  EXPECT_EQ(get(getDouble, session, "Mod2", "Dev.Temperature").code, 0);
                  longest = std::max(longest.load(), Real::now() - start);
                  ++calls;
              }
          }) {}
    ~Reader() {
        stopped = true;
        thread.join();
    }
    void startAgain() { longest = Real::duration::zero(); }
    // With the call that is under way.
    Real::duration longestCall() const {
        for (const std::uint64_t before = calls; calls <= before + 1;) {
            std::this_thread::yield();
        }
        return longest;
    }

  private:
    Session session;
    std::atomic<bool> stopped{false};
    std::atomic<std::uint64_t> calls{0};
    std::atomic<Real::duration> longest{Real::duration::zero()};
    std::thread thread;
};

Real::duration readRecord(Handle session) {
    Status status;
    double* record = nullptr;
    std::uint32_t count = 0;
    const auto start = Real::now();
    nQITRMCAPI100_getGenericPropertyDoubleArray(session, "Mod4/ch0", "DIG.Waveform", &record,
                                                &count, &status);
    const auto took = Real::now() - start;
    nQITRMCAPI100_freeArray(record);
    EXPECT_EQ(count, recordLength);
    return took;
}

// A reader that had to wait would wait for a whole record once, in each attempt.
TEST(SharedReadTest, AShortReadingCallDoesNotWaitForALongOne) {
    Session session("Mod4");
    ASSERT_EQ(set(setUInt32, session, "Mod4", "DIG.RecordLength", recordLength).code, 0);
    auto alone = readRecord(session);
    for (int i = 0; i < 3; ++i) {
        alone = std::min(alone, readRecord(session));
    }
    Reader reader;
    auto wait = Real::duration::max();
    for (int attempt = 0; attempt < 20 && wait >= alone / 2; ++attempt) {
        reader.startAgain();
        readRecord(session);
        wait = std::min(wait, reader.longestCall());
    }
    EXPECT_LT(wait, alone / 2);
    EXPECT_EQ(resetDevices(session, "Mod4"), 0);
}

TEST(SharedReadTest, ManyThreadsMayOpenAndClosePropertiesAtOnce) {
    Session session("Mod4");
    const std::uint32_t before = outstanding().openProperties;
    const auto openAndClose = [&] {
        for (int i = 0; i < 1000; ++i) {
            Status status;
            nQITRMCAPI100_Property handle = 0;
            nQITRMCAPI100_openGenericProperty(session, "Mod4", "DIG.RecordLength", &handle,
                                              &status);
            std::int32_t type = 0;
            nQITRMCAPI100_getPropertyPropertyInt32(handle, "Prop.DataType", &type, &status);
            nQITRMCAPI100_closeProperty(handle, &status);
            EXPECT_EQ(status.code, 0);
            EXPECT_EQ(type, 6);
        }
    };
    std::thread first(openAndClose);
    std::thread second(openAndClose);
    first.join();
    second.join();
    EXPECT_EQ(outstanding().openProperties, before);
}

// The list of all devices is shared by its readers, and made again after each change.
TEST(SharedReadTest, ListsStayWholeWhileADeviceIsRenamed) {
    const std::uint32_t before = outstanding().textArrays;
    std::atomic<bool> stopped{false};
    const auto read = [&] {
        Session session;
        while (!stopped) {
            const Names names = session.systemList("Sys.Devices");
            ASSERT_EQ(names.size(), 5u);
            EXPECT_TRUE(names[2] == "Mod2" || names[2] == "Renamed") << names[2];
        }
    };
    std::thread first(read);
    std::thread second(read);
    Session session("Mod2");
    for (int i = 0; i < 200; ++i) {
        Status status;
        nQITRMCAPI100_renameDevice(session, i % 2 == 0 ? "Mod2" : "Renamed",
                                   i % 2 == 0 ? "Renamed" : "Mod2", &status);
        EXPECT_EQ(status.code, 0) << status.text();
    }
    stopped = true;
    first.join();
    second.join();
    EXPECT_EQ(outstanding().textArrays, before);
}

}  // namespace
