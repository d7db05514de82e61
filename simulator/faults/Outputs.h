#pragma once

#include "faults/FaultPlan.h"
#include "sessions/Simulator.h"
#include "trace/Call.h"

namespace simulator {

// Changes what a call has lent to its caller. What is replaced is freed. Throws
// std::bad_alloc, also when more than 1 GiB of texts would be lent.
void distortOutputs(const Call& call, const OutputFault& output);

// Takes back all that a call has lent or opened, and sets its outputs to 0 or null.
void takeBackOutputs(Simulator& simulator, const Call& call) noexcept;

}  // namespace simulator
