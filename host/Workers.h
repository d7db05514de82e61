#pragma once

#include <pthread.h>
#include <sys/epoll.h>

#include <atomic>
#include <condition_variable>
#include <cstddef>
#include <cstdint>
#include <list>
#include <mutex>

namespace host {

// Something that has work to do whenever a file descriptor is ready.
class Watched {
  public:
    virtual ~Watched() = default;

    // Only serve() may change these two. The events are those of epoll, without flags.
    virtual int descriptor() const = 0;
    virtual std::uint32_t events() const = 0;

    // Does the work that there is. False when this is to be destroyed.
    virtual bool serve() noexcept = 0;
};

// Threads that serve what is ready, each of them one thing at a time. As many work as the
// machine has processors, but at least two. When a call of serve() lasts longer than a moment,
// another thread takes the place of the one that is in it, so that a call that waits delays no
// other one.
class Workers {
  public:
    // most: how many threads there may be at once; when all of them wait, nothing else is served.
    // Throws Failure when there is not a single thread.
    explicit Workers(std::uint32_t most);

    // Nothing may be watched any more.
    ~Workers();
    Workers(const Workers&) = delete;
    Workers& operator=(const Workers&) = delete;

    // From now on one thread at a time serves `watched`, which belongs to the workers. False when
    // memory runs out; `watched` is then as it was.
    bool watch(Watched* watched) noexcept;

  private:
    // One thread. The number is odd while it serves something. In a cache line of its own, since
    // its thread writes to it all the time.
    struct alignas(64) Worker {
        explicit Worker(Workers& all) : all(all) {}

        Workers& all;
        std::atomic<std::uint32_t> progress{0};
        std::atomic<bool> ended{false};
        std::uint32_t lastSeen = 0;
        std::uint32_t ticksWithoutProgress = 0;
        pthread_t thread = {};
    };

    void end() noexcept;
    static void* run(void* worker);
    static void* runSupervisor(void* workers);
    void serveUntilEnd(Worker& worker) noexcept;
    bool waitFor(epoll_event& event) noexcept;
    bool lookFor(epoll_event& event) noexcept;
    void serve(Watched* watched) noexcept;
    bool isSurplus() noexcept;
    void supervise();
    bool startWorker();
    void joinEndedWorkers();
    bool adjustNumber(std::size_t able);
    bool waitForTick(bool isQuiet);
    void wakeSupervisor() noexcept;

    const std::size_t most;
    const std::size_t usual;
    const int readySet;  // of epoll
    const int endEvent;  // readable from the end on
    std::list<Worker> workers;
    std::atomic<bool> isLooking{false};
    pthread_t supervisor = {};

    std::atomic<std::size_t> surplus{0};
    std::uint32_t ticksSinceShortage = 0;
    std::uint32_t quietTicks = 0;

    std::mutex mutex;
    std::condition_variable wake;
    std::atomic<bool> supervisorSleeps{false};
    bool ending = false;
};

}  // namespace host
