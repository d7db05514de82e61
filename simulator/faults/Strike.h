#pragma once

#include <memory>
#include <mutex>

#include "sessions/Simulator.h"
#include "trace/Call.h"

namespace simulator {

// What a fault does to one call. Needs the simulator's mutex to be held.
class Strike {
  public:
    // Counts the call, and finds the fault that strikes it, if one does.
    Strike(Simulator& simulator, const Call& call);

    // Lets a delay pass, with the mutex given up. Then throws the failure of a call that is not to
    // be carried out.
    void before(std::unique_lock<std::mutex>& lock) const;
    // To be called when the call has done its work. Changes what it gives out, then throws the
    // warning or the failure that it is to end with. A failure, also one for want of memory, leaves
    // nothing lent and nothing open.
    void after() const;

  private:
    Simulator& simulator;
    const Call& call;
    // Keeps the fault alive.
    const std::shared_ptr<FaultPlan> plan;
    const Fault* fault = nullptr;
};

}  // namespace simulator
