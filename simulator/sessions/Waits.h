#pragma once

#include <chrono>
#include <condition_variable>
#include <cstdint>
#include <limits>
#include <list>
#include <vector>

#include "Api.h"
#include "model/Chassis.h"
#include "sessions/Clock.h"
#include "sessions/SharedMutex.h"

namespace simulator {

// Seconds that a caller is willing to wait. Refuses what is not a number or below 0. A time longer
// than a day counts as a day.
double checkedTimeout(double seconds);

// Events that happen at a given time. Needs the simulator's mutex to be held.
class Schedule {
  public:
    // The time of the next event if there is none.
    static constexpr std::int64_t never = std::numeric_limits<std::int64_t>::max();

    virtual ~Schedule() = default;
    // The time of the next event, in microseconds of the simulated time.
    virtual std::int64_t next() const = 0;
    // Carries out the events that are due.
    virtual void catchUp() = 0;
};

// One waiting call of a session. It is on the stack of the waiting thread.
struct Wait {
    enum class End { None, Done, Aborted, Closed, DeviceAbsent };

    // devices: what the call is about, for as long as it waits. May be null.
    explicit Wait(nQITRMCAPI100_Session session, const std::vector<Device*>* devices = nullptr)
        : session(session), devices(devices) {}
    // Ends the wait if nothing has ended it before.
    void finish(End reason) noexcept;

    const nQITRMCAPI100_Session session;
    const std::vector<Device*>* const devices;
    End end = End::None;
    // The device because of which the wait ended with End::DeviceAbsent.
    const Device* absentDevice = nullptr;
    Absence absence = Absence::None;
    std::condition_variable_any wake;
};

// All calls that wait at the moment. Every operation needs the simulator's mutex to be held.
class Waits {
  public:
    explicit Waits(Clock& clock) : clock(clock) {}

    // Sleeps, with the mutex unlocked, until the wait ends or the simulated time is over. Returns
    // whether the wait ended by Wait::End::Done; refuses when the session was aborted or closed,
    // and when one of the wait's devices does not answer any more. Where time goes by calls it
    // sleeps in real time, as simulated time might not advance otherwise.
    bool sleep(Wait& wait, double seconds, WriteLock& lock);
    // Lets the time pass that an operation takes, unless the wait ends. Refuses like sleep().
    void spend(Wait& wait, double seconds, WriteLock& lock);

    // Ends all waits of a session.
    void endAll(nQITRMCAPI100_Session session, Wait::End reason) noexcept;
    // Ends all waits about a device that does not answer any more.
    void endAbout(const Device& device) noexcept;

    // Sets what is carried out in time during waits. It must exist as long as this object is used.
    void setSchedule(Schedule& followed) { schedule = &followed; }
    // To be called when the schedule has changed.
    void scheduleChanged() noexcept;

  private:
    using Deadline = std::chrono::steady_clock::time_point;

    Deadline wakeBefore(Deadline deadline) const;
    void sleepUntil(Deadline deadline, Wait& wait, WriteLock& lock);
    void expectUndisturbed(const Wait& wait) const;

    Clock& clock;
    std::list<Wait*> waiting;
    Schedule* schedule = nullptr;
};

}  // namespace simulator
