#include "qitrmcwebsvc/RequestAccessLock.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <atomic>
#include <condition_variable>
#include <future>
#include <memory>
#include <mutex>
#include <stdexcept>
#include <vector>

#include "support/ObservedThread.h"

using nQITRMCWEBSVC100::ExclusiveAccess;
using nQITRMCWEBSVC100::RequestAccessLock;
using nQITRMCWEBSVC100::SharedAccess;

// How many of the next waits end at once without a notification, which the standard allows. This
// program is linked with --wrap for std::condition_variable::wait.
static std::atomic<int> spuriousWakeUps{0};

extern "C" {
void __real__ZNSt18condition_variable4waitERSt11unique_lockISt5mutexE(
    std::condition_variable* condition, std::unique_lock<std::mutex>* hold);
void __wrap__ZNSt18condition_variable4waitERSt11unique_lockISt5mutexE(
    std::condition_variable* condition, std::unique_lock<std::mutex>* hold);
}

void __wrap__ZNSt18condition_variable4waitERSt11unique_lockISt5mutexE(
    std::condition_variable* condition, std::unique_lock<std::mutex>* hold) {
    if (spuriousWakeUps > 0) {
        --spuriousWakeUps;
    } else {
        __real__ZNSt18condition_variable4waitERSt11unique_lockISt5mutexE(condition, hold);
    }
}

namespace {

// Callers that take the lock on threads of their own and hold it until released by the test.
class Caller {
  public:
    enum Mode { Shared, Exclusive };

    Caller(RequestAccessLock& lock, Mode mode)
        : thread([this, &lock, mode] {
              mode == Shared ? lock.lockShared() : lock.lockExclusive();
              entered = true;
              left.get_future().wait();
              mode == Shared ? lock.unlockShared() : lock.unlockExclusive();
          }) {}
    ~Caller() { leave(); }

    bool isIn() const { return entered; }
    void waitUntilIn() const {
        while (!entered) {
            ::sched_yield();
        }
    }
    // A caller that holds the lock is blocked in a wait too.
    bool waitUntilBlocked() const { return thread.waitUntilBlocked(); }
    void leave() {
        if (!leaving) {
            left.set_value();
        }
        leaving = true;
        thread.join();
    }

  private:
    std::atomic<bool> entered{false};
    bool leaving = false;
    std::promise<void> left;
    ObservedThread thread;
};

TEST(RequestAccessLock, LetsSharedCallersOverlap) {
    RequestAccessLock lock;
    Caller first(lock, Caller::Shared);
    first.waitUntilIn();
    Caller second(lock, Caller::Shared);
    second.waitUntilIn();
}

TEST(RequestAccessLock, MakesAnExclusiveCallerWaitForASharedHolder) {
    RequestAccessLock lock;
    Caller holder(lock, Caller::Shared);
    holder.waitUntilIn();
    Caller batch(lock, Caller::Exclusive);
    ASSERT_TRUE(batch.waitUntilBlocked());
    EXPECT_FALSE(batch.isIn());
    holder.leave();
    batch.waitUntilIn();
}

TEST(RequestAccessLock, DelaysSharedCallersThatComeAfterAWaitingExclusiveOne) {
    RequestAccessLock lock;
    Caller holder(lock, Caller::Shared);
    holder.waitUntilIn();
    Caller batch(lock, Caller::Exclusive);
    ASSERT_TRUE(batch.waitUntilBlocked());
    Caller late(lock, Caller::Shared);
    ASSERT_TRUE(late.waitUntilBlocked());
    EXPECT_FALSE(late.isIn());
    holder.leave();
    batch.waitUntilIn();
    ASSERT_TRUE(late.waitUntilBlocked());
    EXPECT_FALSE(late.isIn());
    batch.leave();
    late.waitUntilIn();
}

TEST(RequestAccessLock, AdmitsAnExclusiveCallerAtTheFirstSharedReleaseBesideTheSecondHolder) {
    RequestAccessLock lock;
    Caller first(lock, Caller::Shared);
    first.waitUntilIn();
    Caller second(lock, Caller::Shared);
    second.waitUntilIn();
    Caller batch(lock, Caller::Exclusive);
    ASSERT_TRUE(batch.waitUntilBlocked());
    first.leave();
    batch.waitUntilIn();  // the second holder has not left
}

TEST(RequestAccessLock, AdmitsASecondBatchBesideTheRunningOneWhenASharedHolderLeaves) {
    RequestAccessLock lock;
    auto first = std::make_unique<Caller>(lock, Caller::Shared);
    first->waitUntilIn();
    Caller second(lock, Caller::Shared);
    second.waitUntilIn();
    Caller runningBatch(lock, Caller::Exclusive);
    ASSERT_TRUE(runningBatch.waitUntilBlocked());
    first->leave();
    runningBatch.waitUntilIn();
    Caller waitingBatch(lock, Caller::Exclusive);
    ASSERT_TRUE(waitingBatch.waitUntilBlocked());
    second.leave();
    waitingBatch.waitUntilIn();  // the running batch has not left
}

TEST(RequestAccessLock, KeepsTwoBatchesApartWhenNoSharedHolderLeaves) {
    RequestAccessLock lock;
    Caller first(lock, Caller::Exclusive);
    first.waitUntilIn();
    Caller second(lock, Caller::Exclusive);
    ASSERT_TRUE(second.waitUntilBlocked());
    EXPECT_FALSE(second.isIn());
    first.leave();
    second.waitUntilIn();
}

TEST(RequestAccessLock, ASharedCallerChecksAgainAfterASpuriousWakeup) {
    RequestAccessLock lock;
    Caller batch(lock, Caller::Exclusive);
    batch.waitUntilIn();
    spuriousWakeUps = 3;
    Caller reader(lock, Caller::Shared);
    ASSERT_TRUE(reader.waitUntilBlocked());
    EXPECT_EQ(spuriousWakeUps.exchange(0), 0);
    EXPECT_FALSE(reader.isIn());
    batch.leave();
    reader.waitUntilIn();
}

TEST(RequestAccessLock, WakesOneWaitingBatchAtATime) {
    RequestAccessLock lock;
    Caller running(lock, Caller::Exclusive);
    running.waitUntilIn();
    std::vector<std::unique_ptr<Caller>> waiting;
    for (int i = 0; i < 3; ++i) {
        waiting.push_back(std::make_unique<Caller>(lock, Caller::Exclusive));
        ASSERT_TRUE(waiting.back()->waitUntilBlocked());
    }
    running.leave();
    for (; !waiting.empty(); waiting.erase(waiting.begin())) {
        const auto isIn = [](const std::unique_ptr<Caller>& caller) { return caller->isIn(); };
        while (std::none_of(waiting.begin(), waiting.end(), isIn)) {
            ::sched_yield();
        }
        for (const auto& caller : waiting) {
            ASSERT_TRUE(caller->waitUntilBlocked());
        }
        ASSERT_EQ(std::count_if(waiting.begin(), waiting.end(), isIn), 1);
        std::iter_swap(waiting.begin(), std::find_if(waiting.begin(), waiting.end(), isIn));
        waiting.front()->leave();
    }
}

TEST(RequestAccessLock, WakesSharedCallersOnlyWhenNoExclusiveCallerIsLeft) {
    RequestAccessLock lock;
    Caller first(lock, Caller::Exclusive);
    first.waitUntilIn();
    Caller second(lock, Caller::Exclusive);
    ASSERT_TRUE(second.waitUntilBlocked());
    Caller reader(lock, Caller::Shared);
    ASSERT_TRUE(reader.waitUntilBlocked());
    first.leave();
    second.waitUntilIn();
    ASSERT_TRUE(reader.waitUntilBlocked());
    EXPECT_FALSE(reader.isIn());
    second.leave();
    reader.waitUntilIn();
}

TEST(RequestAccessLock, WakesAllSharedCallersAtOnce) {
    RequestAccessLock lock;
    Caller batch(lock, Caller::Exclusive);
    batch.waitUntilIn();
    std::vector<std::unique_ptr<Caller>> readers;
    for (int i = 0; i < 4; ++i) {
        readers.push_back(std::make_unique<Caller>(lock, Caller::Shared));
        ASSERT_TRUE(readers.back()->waitUntilBlocked());
    }
    batch.leave();
    for (const auto& reader : readers) {
        reader->waitUntilIn();
    }
}

TEST(RequestAccessLock, IsFreeAfterAnExceptionInEitherMode) {
    RequestAccessLock lock;
    EXPECT_THROW(
        {
            SharedAccess access(lock);
            throw std::runtime_error("in a request");
        },
        std::runtime_error);
    EXPECT_THROW(
        {
            ExclusiveAccess access(lock);
            throw std::runtime_error("in a batch");
        },
        std::runtime_error);
    Caller batch(lock, Caller::Exclusive);
    batch.waitUntilIn();
    batch.leave();
    Caller single(lock, Caller::Shared);
    single.waitUntilIn();
}

}  // namespace
