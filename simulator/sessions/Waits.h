#pragma once

#include <condition_variable>
#include <list>
#include <mutex>

#include "Api.h"
#include "sessions/Clock.h"

namespace simulator {

// Seconds that a caller is willing to wait. Refuses what is not a number or below 0. A time longer
// than a day counts as a day.
double checkedTimeout(double seconds);

// One call of a session that waits. It lives on the stack of the waiting thread.
struct Wait {
    enum class End { none, done, aborted, closed };

    explicit Wait(nQITRMCAPI100_Session session) : session(session) {}
    // Ends the wait if nothing has ended it before.
    void finish(End reason) noexcept;

    const nQITRMCAPI100_Session session;
    End end = End::none;
    std::condition_variable wake;
};

// All calls that wait at the moment. Every operation needs the simulator's mutex to be held.
class Waits {
  public:
    explicit Waits(Clock& clock) : clock(clock) {}

    // Sleeps, with the mutex given up, until the wait ends or the simulated time is over. Returns
    // whether the wait ended by Wait::End::done; refuses when the session was aborted or closed.
    // Where time goes by calls it sleeps in real time, as nobody else would move time on.
    bool sleep(Wait& wait, double seconds, std::unique_lock<std::mutex>& lock);
    // Lets the time pass that something takes. Refuses like sleep().
    void spend(nQITRMCAPI100_Session session, double seconds, std::unique_lock<std::mutex>& lock);

    // Ends all waits of a session.
    void endAll(nQITRMCAPI100_Session session, Wait::End reason) noexcept;

  private:
    Clock& clock;
    std::list<Wait*> waiting;
};

}  // namespace simulator
