#include "qitrmcwebsvc/RequestAccessLock.h"

#include <gtest/gtest.h>

#include <atomic>
#include <memory>
#include <stdexcept>
#include <vector>

#include "support/ObservedThread.h"

using nQITRMCWEBSVC100::ExclusiveAccess;
using nQITRMCWEBSVC100::RequestAccessLock;
using nQITRMCWEBSVC100::SharedAccess;

namespace {

// Callers that take the lock on threads of their own and hold it until they are told to leave.
class Caller {
  public:
    enum Mode { Shared, Exclusive };

    Caller(RequestAccessLock& lock, Mode mode)
        : thread([this, &lock, mode] {
              mode == Shared ? lock.lockShared() : lock.lockExclusive();
              entered = true;
              while (!leaving)
                  ::sched_yield();
              mode == Shared ? lock.unlockShared() : lock.unlockExclusive();
          }) {}
    ~Caller() { leave(); }

    bool isIn() const { return entered; }
    void waitUntilIn() const {
        while (!entered)
            ::sched_yield();
    }
    bool waitUntilBlocked() const { return thread.waitUntilBlocked(); }
    void leave() {
        leaving = true;
        thread.join();
    }

  private:
    std::atomic<bool> entered{false};
    std::atomic<bool> leaving{false};
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

TEST(RequestAccessLock, HoldsOffSharedCallersThatComeAfterAWaitingExclusiveOne) {
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

TEST(RequestAccessLock, LetsAnExclusiveCallerInAtTheFirstSharedReleaseBesideTheSecondHolder) {
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

TEST(RequestAccessLock, LetsASecondBatchInWhenASharedHolderLeavesBesideTheRunningOne) {
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
    for (const auto& reader : readers)
        reader->waitUntilIn();
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
