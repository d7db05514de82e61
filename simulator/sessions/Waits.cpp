#include "sessions/Waits.h"

#include <algorithm>
#include <chrono>

#include "model/Values.h"
#include "status/Refusal.h"

namespace simulator {

namespace {

// Far below what the clocks of small systems can represent.
constexpr double longestWait = 24.0 * 60.0 * 60.0;

}  // namespace

double checkedTimeout(double seconds) {
    if (!(seconds >= 0.0)) {
        throw Refusal(code::invalidTimeout).usage(tag::timeout, numberText(seconds));
    }
    return std::min(seconds, longestWait);
}

void Wait::finish(End reason) noexcept {
    if (end == End::None) {
        end = reason;
        wake.notify_one();
    }
}

namespace {

// Keeps a wait in the list of all waits during its lifetime.
class Waiting {
  public:
    Waiting(std::list<Wait*>& list, Wait& wait)
        : list(list), place(list.insert(list.end(), &wait)) {}
    Waiting(const Waiting&) = delete;
    Waiting& operator=(const Waiting&) = delete;
    ~Waiting() { list.erase(place); }

  private:
    std::list<Wait*>& list;
    const std::list<Wait*>::iterator place;
};

}  // namespace

Waits::Deadline Waits::wakeBefore(Deadline deadline) const {
    if (schedule == nullptr || schedule->next() == Schedule::never || clock.goesByCalls()) {
        return deadline;
    }
    const double seconds = static_cast<double>(schedule->next() - clock.now()) / 1e6;
    const auto ahead = clock.realTime(std::clamp(seconds, 0.0, longestWait));
    return std::min(deadline, std::chrono::steady_clock::now() + ahead);
}

void Waits::sleepUntil(Deadline deadline, Wait& wait, WriteLock& lock) {
    const Waiting isWaiting(waiting, wait);
    while (wait.end == Wait::End::None && std::chrono::steady_clock::now() < deadline) {
        wait.wake.wait_until(lock, wakeBefore(deadline));
        if (schedule != nullptr) {
            schedule->catchUp();
        }
    }
}

void Waits::expectUndisturbed(const Wait& wait) const {
    if (wait.end == Wait::End::DeviceAbsent) {
        expectPresent(*wait.absentDevice, wait.absence);
    }
    if (wait.end == Wait::End::Aborted) {
        throw Refusal(code::aborted);
    }
    if (wait.end == Wait::End::Closed) {
        throw Refusal(code::unknownSession).usage(tag::sessionHandle, wait.session);
    }
}

bool Waits::sleep(Wait& wait, double seconds, WriteLock& lock) {
    sleepUntil(std::chrono::steady_clock::now() + clock.realTime(seconds), wait, lock);
    expectUndisturbed(wait);
    return wait.end == Wait::End::Done;
}

void Waits::spend(Wait& wait, double seconds, WriteLock& lock) {
    if (!clock.goesByCalls()) {
        sleep(wait, seconds, lock);
        return;
    }
    const Waiting isWaiting(waiting, wait);
    clock.skip(seconds);
    if (schedule != nullptr) {
        schedule->catchUp();
    }
    expectUndisturbed(wait);
}

void Waits::endAll(nQITRMCAPI100_Session session, Wait::End reason) noexcept {
    for (Wait* wait : waiting) {
        if (wait->session == session) {
            wait->finish(reason);
        }
    }
}

void Waits::endAbout(const Device& device) noexcept {
    for (Wait* wait : waiting) {
        if (wait->end == Wait::End::None && wait->devices != nullptr &&
            std::find(wait->devices->begin(), wait->devices->end(), &device) !=
                wait->devices->end()) {
            wait->absentDevice = &device;
            wait->absence = device.absence;
            wait->finish(Wait::End::DeviceAbsent);
        }
    }
}

void Waits::scheduleChanged() noexcept {
    for (Wait* wait : waiting) {
        wait->wake.notify_one();
    }
}

}  // namespace simulator
