#include "host/Workers.h"

#include <sched.h>
#include <sys/epoll.h>
#include <sys/eventfd.h>
#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <new>
#include <thread>

#include "host/Failure.h"

namespace host {

namespace {

// A quarter of what a main thread has; 512 of them fit a 32-bit address space.
constexpr std::size_t stackSize = 2 * 1024 * 1024;

constexpr std::chrono::milliseconds tick(4);

// A call that lasts so many ticks lasts long. A thread that only waits for a processor should not
// be taken for one that waits in a call.
constexpr std::uint32_t ticksOfLongCall = 2;

// How many ticks threads are kept that are not needed at the moment: calls that last may recur.
constexpr std::uint32_t ticksWithSurplus = 250;

// How many ticks without any work let the supervisor sleep until there is some.
constexpr std::uint32_t ticksUntilSleep = 50;

// The thread sanitizer knows that a descriptor which is added is handed over to the thread that
// waits for it, but not that one which is modified is.
#if defined(__SANITIZE_THREAD__)
constexpr bool canModify = false;
#else
constexpr bool canModify = true;
#endif

// How often a thread looks for more work before it sleeps, some 50 us. It takes longer to wake a
// sleeping processor than to serve most requests.
constexpr int mostLooks = 100;

bool startThread(pthread_t& thread, void* (*function)(void*), void* argument) {
    pthread_attr_t attributes;
    pthread_attr_init(&attributes);
    pthread_attr_setstacksize(&attributes, stackSize);
    const int error = pthread_create(&thread, &attributes, function, argument);
    pthread_attr_destroy(&attributes);
    return error == 0;
}

bool setWatched(int readySet, int operation, Watched* watched) {
    epoll_event event = {};
    event.events = watched->events() | EPOLLONESHOT;
    event.data.ptr = watched;
    return epoll_ctl(readySet, operation, watched->descriptor(), &event) == 0;
}

}  // namespace

Workers::Workers(std::uint32_t most)
    : most(most),
      usual(std::min(most, std::max(2u, std::thread::hardware_concurrency()))),
      readySet(epoll_create1(EPOLL_CLOEXEC)),
      endEvent(eventfd(0, EFD_CLOEXEC)) {
    epoll_event event = {};
    event.events = EPOLLIN;
    const bool canEnd = epoll_ctl(readySet, EPOLL_CTL_ADD, endEvent, &event) == 0;
    while (canEnd && workers.size() < usual && startWorker()) {
    }
    if (workers.empty() || !startThread(supervisor, runSupervisor, this)) {
        end();
        throw Failure("The HTTP server cannot start. Free memory or threads of this machine.");
    }
}

Workers::~Workers() {
    {
        const std::lock_guard<std::mutex> lock(mutex);
        ending = true;
        wake.notify_one();
    }
    pthread_join(supervisor, nullptr);
    end();
}

void Workers::end() noexcept {
    eventfd_write(endEvent, 1);
    for (const Worker& worker : workers) {
        pthread_join(worker.thread, nullptr);
    }
    close(readySet);
    close(endEvent);
}

bool Workers::watch(Watched* watched) noexcept {
    return setWatched(readySet, EPOLL_CTL_ADD, watched);
}

void* Workers::run(void* argument) {
    auto& worker = *static_cast<Worker*>(argument);
    worker.all.serveUntilEnd(worker);
    worker.ended = true;
    return nullptr;
}

void Workers::serveUntilEnd(Worker& worker) noexcept {
    epoll_event event = {};
    while (!isSurplus()) {
        if (!waitFor(event)) {
            continue;
        }
        auto* watched = static_cast<Watched*>(event.data.ptr);
        if (watched == nullptr) {
            return;
        }
        ++worker.progress;
        if (supervisorSleeps) {
            wakeSupervisor();
        }
        serve(watched);
        ++worker.progress;
    }
}

// False when there is nothing to do after all.
bool Workers::waitFor(epoll_event& event) noexcept {
    return epoll_wait(readySet, &event, 1, 0) == 1 || lookFor(event) ||
           epoll_wait(readySet, &event, 1, -1) == 1;
}

// Looks some times whether something is ready, and gives way to other threads and programs while
// nothing is. Only one thread at a time does so: one is enough to find what comes.
bool Workers::lookFor(epoll_event& event) noexcept {
    if (isLooking.exchange(true)) {
        return false;
    }
    bool found = false;
    for (int looks = 0; looks < mostLooks && !found; ++looks) {
        sched_yield();
        found = epoll_wait(readySet, &event, 1, 0) == 1;
    }
    isLooking = false;
    return found;
}

void Workers::serve(Watched* watched) noexcept {
    const int before = watched->descriptor();
    bool goesOn = watched->serve();
    if (canModify && goesOn && watched->descriptor() == before) {
        goesOn = setWatched(readySet, EPOLL_CTL_MOD, watched);
    } else if (goesOn) {
        epoll_ctl(readySet, EPOLL_CTL_DEL, before, nullptr);
        goesOn = setWatched(readySet, EPOLL_CTL_ADD, watched);
    }
    if (!goesOn) {
        delete watched;
    }
}

// Whether the calling thread is one too many.
bool Workers::isSurplus() noexcept {
    std::size_t count = surplus;
    while (count > 0) {
        if (surplus.compare_exchange_weak(count, count - 1)) {
            return true;
        }
    }
    return false;
}

void* Workers::runSupervisor(void* workers) {
    static_cast<Workers*>(workers)->supervise();
    return nullptr;
}

void Workers::supervise() {
    bool isQuiet = false;
    while (waitForTick(isQuiet)) {
        joinEndedWorkers();
        std::size_t stuck = 0;
        isQuiet = true;
        for (Worker& worker : workers) {
            const std::uint32_t progress = worker.progress;
            const bool isSame = progress == worker.lastSeen;
            worker.lastSeen = progress;
            worker.ticksWithoutProgress = isSame ? worker.ticksWithoutProgress + 1 : 0;
            const bool isLong = worker.ticksWithoutProgress >= ticksOfLongCall;
            stuck += isLong && progress % 2 != 0 ? 1 : 0;
            isQuiet = isQuiet && isSame;
        }
        isQuiet = adjustNumber(workers.size() - stuck) && isQuiet;
    }
}

// Called with the number of threads that can serve. False when there should be more, but could not
// be started.
bool Workers::adjustNumber(std::size_t able) {
    const std::size_t wanted = std::min(usual, able + most - workers.size());
    if (able < wanted) {
        surplus = 0;
        ticksSinceShortage = 0;
        while (able < wanted && startWorker()) {
            ++able;
        }
    } else if (able > usual && ++ticksSinceShortage > ticksWithSurplus && surplus == 0) {
        surplus = able - usual;
    }
    return able >= wanted;
}

bool Workers::startWorker() {
    try {
        Worker& worker = workers.emplace_back(*this);
        if (startThread(worker.thread, run, &worker)) {
            return true;
        }
        workers.pop_back();
    } catch (const std::bad_alloc&) {
    }
    return false;
}

void Workers::joinEndedWorkers() {
    workers.remove_if([](const Worker& worker) {
        return worker.ended && pthread_join(worker.thread, nullptr) == 0;
    });
}

// Returns after a tick, or when there is work after a long time without. False at the end.
bool Workers::waitForTick(bool isQuiet) {
    quietTicks = isQuiet ? quietTicks + 1 : 0;
    std::unique_lock<std::mutex> lock(mutex);
    if (quietTicks < ticksUntilSleep) {
        wake.wait_for(lock, tick, [this] { return ending; });
        return !ending;
    }
    supervisorSleeps = true;
    // A thread that began before it could see that has progressed.
    const auto hasProgress = [](const Worker& worker) {
        return worker.progress != worker.lastSeen;
    };
    if (std::none_of(workers.begin(), workers.end(), hasProgress)) {
        wake.wait(lock, [this] { return ending || !supervisorSleeps; });
    }
    supervisorSleeps = false;
    return !ending;
}

void Workers::wakeSupervisor() noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    supervisorSleeps = false;
    wake.notify_one();
}

}  // namespace host
