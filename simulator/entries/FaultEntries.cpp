#include <mutex>
#include <new>
#include <string>

#include "description/Description.h"
#include "entries/Border.h"
#include "entries/Lending.h"
#include "faults/FaultReader.h"
#include "sessions/Simulator.h"

using namespace simulator;

namespace {

// Returns the code, and puts words about a failure into `why`.
int32_t setFaults(const char* json, std::string& why) {
    try {
        Simulator& simulator = Simulator::instance();
        const std::unique_lock<std::mutex> lock(simulator.mutex);
        simulator.faults.replace(readFaults(required(json, "json"), *simulator.chassis));
        return 0;
    } catch (const DescriptionFault& fault) {
        why = fault.pointer + (fault.pointer.empty() ? "" : " ") + fault.wrong + "; " + fault.right;
        return code::invalidFaults.number;
    } catch (const Refusal& refusal) {
        why = refusal.text();
        return refusal.code();
    }
}

}  // namespace

int32_t qitrmcsim_setFaults(const char* json, char** reason) {
    if (reason != nullptr) {
        *reason = nullptr;
    }
    try {
        std::string why;
        const int32_t code = setFaults(json, why);
        if (code != 0 && reason != nullptr) {
            *reason = lendText(why);
        }
        return code;
    } catch (const std::bad_alloc&) {
        return code::outOfMemory.number;
    } catch (...) {
        return code::driverFault.number;
    }
}
