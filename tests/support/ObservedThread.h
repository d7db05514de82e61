#pragma once

#include <sys/syscall.h>
#include <unistd.h>

#include <sched.h>
#include <atomic>
#include <fstream>
#include <functional>
#include <string>
#include <thread>

// A thread that lets a test find out whether it is waiting.
class ObservedThread {
  public:
    explicit ObservedThread(std::function<void()> work)
        : thread([this, work = std::move(work)] {
              id = static_cast<int>(::syscall(SYS_gettid));
              work();
              ended = true;
          }) {}
    ~ObservedThread() { join(); }

    void join() {
        if (thread.joinable()) {
            thread.join();
        }
    }

    bool hasEnded() const { return ended; }

    // Returns true once the thread is blocked in a wait, false once it has ended.
    bool waitUntilBlocked() const {
        for (int sleeping = 0; sleeping < 200; ::sched_yield()) {
            if (ended) {
                return false;
            }
            sleeping = isSleeping() ? sleeping + 1 : 0;
        }
        return true;
    }

  private:
    bool isSleeping() const {
        if (id == 0) {
            return false;
        }
        std::ifstream file("/proc/self/task/" + std::to_string(id.load()) + "/stat");
        std::string line;
        std::getline(file, line);
        const auto nameEnd = line.rfind(')');
        return nameEnd != std::string::npos && line.compare(nameEnd, 4, ") S ") == 0;
    }

    std::atomic<int> id{0};
    std::atomic<bool> ended{false};
    std::thread thread;
};
