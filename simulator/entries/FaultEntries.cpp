#include <new>
#include <string>

#include "description/Description.h"
#include "entries/Entry.h"
#include "faults/FaultReader.h"
#include "lending/Lending.h"
#include "sessions/Simulator.h"

using namespace simulator;

namespace {

// Returns the code, and puts a description of a failure into `why`.
std::int32_t setFaults(const char* json, std::string& why) {
    try {
        Driver& driver = Driver::instance();
        const WriteLock lock(driver.simulator.mutex);
        driver.faults.replace(readFaults(required(json, "json"), *driver.simulator.chassis));
        return 0;
    } catch (const DescriptionError& fault) {
        why = fault.pointer + (fault.pointer.empty() ? "" : " ") + fault.wrong + "; " + fault.right;
        return code::invalidFaults.number;
    } catch (const Refusal& refusal) {
        why = refusal.text();
        return refusal.code();
    }
}

}  // namespace

std::int32_t qitrmcsim_setFaults(const char* json, char** reason) {
    if (reason != nullptr) {
        *reason = nullptr;
    }
    try {
        std::string why;
        const std::int32_t code = setFaults(json, why);
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
