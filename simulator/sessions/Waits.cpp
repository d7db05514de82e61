#include "sessions/Waits.h"

#include <algorithm>
#include <chrono>

#include "model/Values.h"
#include "status/Refusal.h"

namespace simulator {

namespace {

// Far below what the clocks of small systems can count.
constexpr double longestWait = 24.0 * 60.0 * 60.0;

}  // namespace

double checkedTimeout(double seconds) {
    if (!(seconds >= 0.0)) {
        throw Refusal(code::invalidTimeout).usage(tag::timeout, numberText(seconds));
    }
    return std::min(seconds, longestWait);
}

void Wait::finish(End reason) noexcept {
    if (end == End::none) {
        end = reason;
        wake.notify_one();
    }
}

bool Waits::sleep(Wait& wait, double seconds, std::unique_lock<std::mutex>& lock) {
    const auto deadline = std::chrono::steady_clock::now() + clock.realTime(seconds);
    const auto place = waiting.insert(waiting.end(), &wait);
    wait.wake.wait_until(lock, deadline, [&] { return wait.end != Wait::End::none; });
    waiting.erase(place);
    if (wait.end == Wait::End::aborted) {
        throw Refusal(code::aborted);
    }
    if (wait.end == Wait::End::closed) {
        throw Refusal(code::unknownSession).usage(tag::sessionHandle, wait.session);
    }
    return wait.end == Wait::End::done;
}

void Waits::spend(nQITRMCAPI100_Session session, double seconds,
                  std::unique_lock<std::mutex>& lock) {
    if (clock.goesByCalls()) {
        clock.skip(seconds);
        return;
    }
    Wait wait(session);
    sleep(wait, seconds, lock);
}

void Waits::endAll(nQITRMCAPI100_Session session, Wait::End reason) noexcept {
    for (Wait* wait : waiting) {
        if (wait->session == session) {
            wait->finish(reason);
        }
    }
}

}  // namespace simulator
