#pragma once

#include "faults/Faults.h"
#include "sessions/Simulator.h"
#include "trace/Trace.h"

namespace simulator {

// The simulator with what observes and disturbs its calls. There is one in the process, created at
// the first use.
struct Driver {
    // Reads the seed and the time scale, the chassis, the lasting state and the faults that the
    // environment names. Refuses with chassisNotLoaded when one of the files or variables is
    // wrong, and with stateNotUsable when the state folder is or when another process has it.
    Driver();

    // Refuses as the constructor did at the first use.
    static Driver& instance();

    // Whether calls are traced or may be disturbed.
    bool isWatched() const { return trace.isOn() || faults.isOn(); }

    Simulator simulator;
    Trace trace;
    Faults faults;
};

}  // namespace simulator
