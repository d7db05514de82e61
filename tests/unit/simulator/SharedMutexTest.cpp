#include "sessions/SharedMutex.h"

#include <gtest/gtest.h>

#include <atomic>
#include <chrono>
#include <future>
#include <mutex>
#include <shared_mutex>

using simulator::SharedMutex;

namespace {

using ReadLock = std::shared_lock<SharedMutex>;

TEST(SharedMutexTest, AWaitingWriterGoesBeforeNewReaders) {
    SharedMutex mutex;
    ReadLock first(mutex);
    std::atomic<bool> isWritten{false};
    const auto writer = std::async(std::launch::async, [&] {
        const std::unique_lock<SharedMutex> lock(mutex);
        isWritten = true;
    });
    // Readers get the mutex until the writer waits for it.
    std::future<bool> reader;
    bool waits = false;
    for (int attempt = 0; attempt < 10000 && !waits; ++attempt) {
        reader = std::async(std::launch::async, [&] {
            const ReadLock lock(mutex);
            return isWritten.load();
        });
        waits = reader.wait_for(std::chrono::milliseconds(200)) == std::future_status::timeout;
    }
    EXPECT_TRUE(waits);
    first.unlock();
    if (waits) {
        EXPECT_TRUE(reader.get());
    }
}

}  // namespace
