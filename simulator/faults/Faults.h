#pragma once

#include <atomic>
#include <list>
#include <memory>
#include <string>

#include "description/TextFile.h"
#include "faults/FaultPlan.h"
#include "sessions/Simulator.h"

namespace simulator {

// The faults and events that are in force. Needs the simulator's mutex to be held, except for
// isOn().
class Faults : public Schedule {
  public:
    // Reads the file that QITRMC_SIM_FAULTS names. A file that is missing has no faults. Refuses
    // with chassisNotLoaded when it is invalid.
    explicit Faults(Simulator& simulator);

    // Whether calls have to be matched with the faults.
    bool isOn() const noexcept { return on.load(); }

    // To be called at the beginning of each call. Reads the file again if it has changed, and
    // carries out events that are due. A file that has become invalid changes nothing, and is
    // reported on standard error once.
    void refresh();
    // Puts another plan into force. Its time begins now.
    void replace(FaultPlan fresh);

    // Lets time pass, with the mutex unlocked, until other faults come into force. Refuses when the
    // session is aborted or closed meanwhile.
    void delay(nQITRMCAPI100_Session session, double seconds, WriteLock& lock);

    // The plan is valid as long as the pointer is kept.
    const std::shared_ptr<FaultPlan>& plan() const { return current; }

    // Whether a time, in seconds since the plan came into force, is now or in the past.
    bool isPast(double seconds) const { return timeOf(seconds) <= simulator.clock.now(); }

    std::int64_t next() const override { return due; }
    void catchUp() override;

  private:
    void readFile();
    void updateIsOn();
    // Carries out the events of one time, and finds the next time.
    void passTime(std::int64_t time);
    void change(Device& device, Absence absence);
    Absence absenceAt(const Device& device, std::int64_t time) const;
    std::int64_t timeOf(double seconds) const;

    Simulator& simulator;
    // Empty when there is no faults file.
    const std::string path;
    FileVersion version;
    std::shared_ptr<FaultPlan> current;
    // When the plan came into force, and when its next event begins or ends, in microseconds of the
    // simulated time.
    std::int64_t start;
    std::int64_t due = never;
    std::list<Wait*> delays;
    std::atomic<bool> on{false};
};

}  // namespace simulator
