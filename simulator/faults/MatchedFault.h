#pragma once

#include <memory>

#include "faults/Faults.h"
#include "sessions/Simulator.h"
#include "trace/Call.h"

namespace simulator {

// The fault that applies to one call, if any. Needs the simulator's mutex to be held.
class MatchedFault {
  public:
    // Matches the call with all faults, which count it, and keeps the first that applies.
    MatchedFault(Simulator& simulator, Faults& faults, const Call& call);

    // To be called before the call is carried out. Lets the delay pass, with the mutex unlocked,
    // and throws the failure of a call that is not to be carried out.
    void applyBefore(WriteLock& lock) const;
    // To be called after the call was carried out. Changes its outputs, and throws the warning or
    // failure of the fault. After a failure, also one for lack of memory, nothing is lent or open.
    void applyAfter() const;

  private:
    Simulator& simulator;
    Faults& faults;
    const Call& call;
    // Keeps the fault alive.
    const std::shared_ptr<FaultPlan> plan;
    const Fault* fault = nullptr;
};

}  // namespace simulator
