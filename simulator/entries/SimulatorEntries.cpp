// What the simulator offers beyond the driver's functions.

#include <shared_mutex>

#include "description/Summary.h"
#include "entries/Driver.h"
#include "lending/Ledger.h"
#include "lending/Lending.h"
#include "status/Refusal.h"

using namespace simulator;

std::int32_t qitrmcsim_start(char** text) {
    *text = nullptr;
    try {
        Simulator& simulator = Driver::instance().simulator;
        const std::shared_lock<SharedMutex> lock(simulator.mutex);
        *text = lendText(summaryOf(*simulator.chassis));
        return 0;
    } catch (const Refusal& refusal) {
        return refusal.code();
    } catch (...) {
        return code::outOfMemory.number;
    }
}

void qitrmcsim_countOutstanding(qitrmcsim_Outstanding* counts) {
    const Ledger& ledger = Ledger::instance();
    *counts = {};
    counts->texts = static_cast<std::uint32_t>(ledger.count(Ledger::Item::Text));
    counts->numberArrays = static_cast<std::uint32_t>(ledger.count(Ledger::Item::Numbers));
    counts->textArrays = static_cast<std::uint32_t>(ledger.count(Ledger::Item::Texts));
    try {
        Simulator& simulator = Driver::instance().simulator;
        const std::shared_lock<SharedMutex> lock(simulator.mutex);
        counts->openProperties = simulator.openProperties.size();
        counts->openCommands = simulator.openCommands.size();
        counts->sessions = simulator.sessions.size();
    } catch (...) {
        // A simulator that did not start has opened nothing.
    }
}

std::uint64_t qitrmcsim_countCalls(void) {
    try {
        return Driver::instance().simulator.clock.calls();
    } catch (...) {
        return 0;  // A simulator that did not start has not been called.
    }
}
