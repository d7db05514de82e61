#include "host/Workers.h"

#include <gtest/gtest.h>
#include <sys/epoll.h>
#include <sys/eventfd.h>
#include <unistd.h>

#include <atomic>
#include <chrono>
#include <filesystem>
#include <fstream>
#include <functional>
#include <future>
#include <string>
#include <thread>
#include <utility>
#include <vector>

namespace {

using host::Watched;
using host::Workers;

constexpr std::chrono::minutes patience(1);
constexpr std::uint32_t most = 20;

// Calls a function for each event that is sent to it, and ends after the event 0.
class Receiver : public Watched {
  public:
    explicit Receiver(std::function<void()> work) : work(std::move(work)) {}
    ~Receiver() override {
        close(received);
        destroyed.set_value();
    }

    int descriptor() const override { return received; }
    std::uint32_t events() const override { return EPOLLIN; }
    bool serve() noexcept override {
        eventfd_t kind = 0;
        eventfd_read(received, &kind);
        if (kind < endKind) {
            work();
        }
        return kind < endKind;
    }

    void send() const { eventfd_write(received, 1); }
    void end() const { eventfd_write(received, endKind); }
    std::future<void> destruction() { return destroyed.get_future(); }

  private:
    static constexpr eventfd_t endKind = 1000000000;

    const std::function<void()> work;
    const int received = eventfd(0, EFD_CLOEXEC);
    std::promise<void> destroyed;
};

// Receivers that are watched, and end with this.
class Receivers {
  public:
    explicit Receivers(Workers& workers) : workers(workers) {}
    ~Receivers() {
        for (std::size_t i = 0; i < all.size(); ++i) {
            all[i]->end();
            EXPECT_EQ(destroyed[i].wait_for(patience), std::future_status::ready);
        }
    }

    Receiver& add(std::function<void()> work) {
        all.push_back(new Receiver(std::move(work)));
        destroyed.push_back(all.back()->destruction());
        EXPECT_TRUE(workers.watch(all.back()));
        return *all.back();
    }

  private:
    Workers& workers;
    std::vector<Receiver*> all;
    std::vector<std::future<void>> destroyed;
};

TEST(Workers, ServeWhatIsReadable) {
    Workers workers(most);
    std::promise<void> served;
    Receivers receivers(workers);
    receivers.add([&] { served.set_value(); }).send();
    EXPECT_EQ(served.get_future().wait_for(patience), std::future_status::ready);
}

// Can be written to at once, and ends when it is served.
class Writer : public Watched {
  public:
    explicit Writer(std::promise<void>& served) : served(served) {}
    ~Writer() override { close(sent); }

    int descriptor() const override { return sent; }
    std::uint32_t events() const override { return EPOLLOUT; }
    bool serve() noexcept override {
        served.set_value();
        return false;
    }

  private:
    const int sent = eventfd(0, EFD_CLOEXEC);
    std::promise<void>& served;
};

TEST(Workers, ServeWhatIsWritable) {
    std::promise<void> served;
    Workers workers(most);
    EXPECT_TRUE(workers.watch(new Writer(served)));
    EXPECT_EQ(served.get_future().wait_for(patience), std::future_status::ready);
}

TEST(Workers, ServeOneThingByOneThreadAtATime) {
    Workers workers(most);
    std::atomic<int> inside{0};
    std::atomic<int> calls{0};
    std::atomic<bool> overlapped{false};
    {
        Receivers receivers(workers);
        Receiver& receiver = receivers.add([&] {
            overlapped = overlapped || ++inside > 1;
            --inside;
            ++calls;
        });
        for (int i = 0; i < 10000 || calls < 10; ++i) {
            receiver.send();
        }
    }
    EXPECT_FALSE(overlapped);
}

// Calls that wait for one another: they end only when each has a thread.
TEST(Workers, ServeOthersWhileCallsLast) {
    Workers workers(most);
    std::promise<void> release;
    const std::shared_future<void> released = release.get_future().share();
    std::atomic<std::uint32_t> waiting{0};
    std::promise<void> served;
    Receivers receivers(workers);
    for (std::uint32_t i = 0; i < most - 1; ++i) {
        receivers
            .add([&] {
                ++waiting;
                released.wait();
            })
            .send();
    }
    receivers.add([&] { served.set_value(); }).send();
    EXPECT_EQ(served.get_future().wait_for(patience), std::future_status::ready);
    while (waiting < most - 1) {
        std::this_thread::yield();
    }
    release.set_value();
}

TEST(Workers, StartNoMoreThreadsThanAllowed) {
    Workers workers(2);
    std::promise<void> release;
    const std::shared_future<void> released = release.get_future().share();
    std::atomic<std::uint32_t> entered{0};
    std::promise<void> bothInside;
    Receivers receivers(workers);
    for (int i = 0; i < 10; ++i) {
        receivers
            .add([&] {
                if (++entered == 2) {
                    bothInside.set_value();
                }
                released.wait();
            })
            .send();
    }
    bothInside.get_future().wait();
    // Several times as long as it takes to notice that calls last.
    EXPECT_EQ(released.wait_for(std::chrono::milliseconds(50)), std::future_status::timeout);
    EXPECT_EQ(entered, 2u);
    release.set_value();
}

// After a long time without work the threads that had to be added are found again.
TEST(Workers, NoticeCallsThatLastAfterAnIdleTime) {
    Workers workers(most);
    std::promise<void> nothing;
    nothing.get_future().wait_for(std::chrono::milliseconds(400));
    std::promise<void> release;
    const std::shared_future<void> released = release.get_future().share();
    std::atomic<std::uint32_t> waiting{0};
    Receivers receivers(workers);
    for (std::uint32_t i = 0; i < most; ++i) {
        receivers
            .add([&] {
                ++waiting;
                released.wait();
            })
            .send();
    }
    const auto giveUp = std::chrono::steady_clock::now() + patience;
    while (waiting < most && std::chrono::steady_clock::now() < giveUp) {
        std::this_thread::yield();
    }
    EXPECT_EQ(waiting, most);
    release.set_value();
}

// The state of each other thread of the process, as the system has it: S for one that sleeps.
std::string statesOfOtherThreads() {
    std::string states;
    for (const auto& task : std::filesystem::directory_iterator("/proc/self/task")) {
        std::string line;
        std::getline(std::ifstream(task.path() / "stat"), line);
        const std::size_t state = line.rfind(") ");
        if (task.path().filename() != std::to_string(gettid()) && state != line.npos) {
            states += line[state + 2];
        }
    }
    return states;
}

// Threads look for more work only for a moment.
TEST(Workers, SleepWhenThereIsNoMoreWork) {
    Workers workers(most);
    std::promise<void> served;
    Receivers receivers(workers);
    receivers.add([&] { served.set_value(); }).send();
    EXPECT_EQ(served.get_future().wait_for(patience), std::future_status::ready);
    const auto giveUp = std::chrono::steady_clock::now() + patience;
    std::string states;
    do {
        states = statesOfOtherThreads();
    } while (states.find_first_not_of('S') != states.npos &&
             std::chrono::steady_clock::now() < giveUp);
    EXPECT_EQ(states.find_first_not_of('S'), states.npos) << states;
    EXPECT_GE(states.size(), 3u);  // two and the supervisor
}

}  // namespace
