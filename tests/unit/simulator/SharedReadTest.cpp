#include <algorithm>
#include <atomic>
#include <chrono>
#include <thread>

#include "Values.h"
#include "qitrmcsim.h"

using namespace drivertest;

namespace {

using Real = std::chrono::steady_clock;

qitrmcsim_Outstanding outstanding() {
    qitrmcsim_Outstanding counts;
    qitrmcsim_countOutstanding(&counts);
    return counts;
}

// Reads a temperature until its end, and counts the calls.
class Reader {
  public:
    Reader()
        : thread([this] {
              while (!stopped) {
                  EXPECT_EQ(get(getDouble, session, "Mod2", "Dev.Temperature").code, 0);
                  ++count;
              }
          }) {}
    ~Reader() {
        stopped = true;
        thread.join();
    }
    uint64_t calls() const { return count; }

  private:
    Session session;
    std::atomic<bool> stopped{false};
    std::atomic<uint64_t> count{0};
    std::thread thread;
};

// A record of this length takes some milliseconds, in which a reader that does not have to wait
// makes thousands of calls. A reader that has to wait makes a few before the record begins.
TEST(SharedReadTest, AShortReadingCallDoesNotWaitForALongOne) {
    Session session("Mod4");
    ASSERT_EQ(set(setUInt32, session, "Mod4", "DIG.RecordLength", 1000000u).code, 0);
    const Reader reader;
    uint64_t most = 0;
    for (int attempt = 0; attempt < 100 && most < 1000; ++attempt) {
        const uint64_t before = reader.calls();
        EXPECT_EQ(getArray(getDoubles, session, "Mod4/ch0", "DIG.Waveform").code, 0);
        most = std::max(most, reader.calls() - before);
    }
    EXPECT_GE(most, 1000u);
    EXPECT_EQ(resetDevices(session, "Mod4"), 0);
}

TEST(SharedReadTest, ReadersDoNotKeepAWriterWaiting) {
    Session session("Mod4");
    const Reader first;
    const Reader second;
    const Reader third;
    const auto start = Real::now();
    for (int i = 0; i < 100; ++i) {
        EXPECT_EQ(set(setUInt32, session, "Mod4", "DIG.RecordLength", 1024u).code, 0);
    }
    EXPECT_LT(Real::now() - start, std::chrono::seconds(10));
    EXPECT_EQ(resetDevices(session, "Mod4"), 0);
}

TEST(SharedReadTest, ManyThreadsMayOpenAndClosePropertiesAtOnce) {
    Session session("Mod4");
    const uint32_t before = outstanding().openProperties;
    const auto openAndClose = [&] {
        for (int i = 0; i < 1000; ++i) {
            Status status;
            nQITRMCAPI100_Property handle = 0;
            nQITRMCAPI100_openGenericProperty(session, "Mod4", "DIG.RecordLength", &handle,
                                              &status);
            int32_t type = 0;
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

}  // namespace
