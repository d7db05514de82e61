#pragma once

#include <atomic>
#include <list>
#include <memory>
#include <mutex>
#include <string>

#include "description/TextFile.h"
#include "faults/FaultPlan.h"
#include "sessions/Sessions.h"
#include "sessions/Waits.h"

namespace simulator {

// The faults and events that are in force. Needs the simulator's mutex to be held, except for
// isOn().
class Faults : public Agenda {
  public:
    // Reads the file that QITRMC_SIM_FAULTS names. A file that is missing has no faults. Refuses
    // with chassisNotLoaded when it is broken.
    Faults(Chassis& chassis, Sessions& sessions, Waits& waits, const Clock& clock);

    // Whether calls have to be shown to this object.
    bool isOn() const noexcept { return on.load(); }

    // To be called at the beginning of each call. Reads the file again when it is another one than
    // the last time, and lets events happen. A file that is broken by then leaves everything as it
    // is, and is told on standard error once.
    void refresh();
    // Puts another plan into force. Its time begins now.
    void replace(FaultPlan fresh);

    // Lets time pass, with the mutex given up, until other faults come into force. Refuses when the
    // session is aborted or closed meanwhile.
    void delay(nQITRMCAPI100_Session session, double seconds, std::unique_lock<std::mutex>& lock);

    // The plan lives on while somebody holds it.
    const std::shared_ptr<FaultPlan>& plan() const { return current; }

    // Whether a time, in seconds since the plan came into force, has come or is over.
    bool isPast(double seconds) const { return timeOf(seconds) <= clock.now(); }

    int64_t next() const override { return due; }
    void catchUp() override;

  private:
    void readFile();
    void noteWatching();
    // Lets happen what belongs to one time, and finds the next.
    void passTime(int64_t time);
    void change(Device& device, Absence absence);
    Absence absenceAt(const Device& device, int64_t time) const;
    int64_t timeOf(double seconds) const;

    Chassis& chassis;
    Sessions& sessions;
    Waits& waits;
    const Clock& clock;
    // Empty when none is named.
    const std::string path;
    FileVersion version;
    std::shared_ptr<FaultPlan> current;
    // When the plan came into force, and when its next event begins or ends, in microseconds of the
    // simulated time.
    int64_t start;
    int64_t due = never;
    std::list<Wait*> delays;
    std::atomic<bool> on{false};
};

}  // namespace simulator
