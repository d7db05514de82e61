#include "faults/Faults.h"

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <utility>

#include "description/ErrorReport.h"
#include "faults/FaultReader.h"

namespace simulator {

namespace {

constexpr const char* variable = "QITRMC_SIM_FAULTS";

std::string pathFromEnvironment() {
    const char* path = std::getenv(variable);
    return path != nullptr ? path : "";
}

}  // namespace

Faults::Faults(Simulator& simulator)
    : simulator(simulator),
      path(pathFromEnvironment()),
      current(std::make_shared<FaultPlan>()),
      start(simulator.clock.now()) {
    simulator.waits.setSchedule(*this);
    updateIsOn();
    try {
        readFile();
    } catch (const DescriptionError& fault) {
        refuseStart(path, fault);
    }
}

void Faults::updateIsOn() {
    on = !path.empty() || !current->isEmpty();
}

void Faults::readFile() {
    const FileVersion present = path.empty() ? FileVersion() : versionOf(path);
    if (present == version) {
        return;
    }
    if (!present.exists) {
        replace({});
        version = present;
        return;
    }
    try {
        if (present.isPipe) {
            throw DescriptionError{"", "is a pipe, which is read but once",
                                   "QITRMC_SIM_FAULTS must name a file on a disk"};
        }
        const TextFile file = readTextFile(path, "QITRMC_SIM_FAULTS must name a readable file");
        replace(readFaults(file.text, *simulator.chassis));
        version = file.version;
    } catch (const DescriptionError&) {
        version = present;
        throw;
    }
}

void Faults::refresh() {
    try {
        readFile();
    } catch (const DescriptionError& fault) {
        reportError(path, {fault.pointer, fault.wrong, fault.right + "; the former faults stay"});
    }
    catchUp();
}

void Faults::replace(FaultPlan fresh) {
    auto former = std::make_shared<FaultPlan>(std::move(fresh));
    const std::int64_t formerStart = std::exchange(start, simulator.clock.now());
    current.swap(former);
    due = start;
    try {
        catchUp();
    } catch (...) {
        current.swap(former);
        start = formerStart;
        throw;
    }
    updateIsOn();
    for (Wait* wait : delays) {
        wait->finish(Wait::End::Done);
    }
    simulator.waits.scheduleChanged();
}

void Faults::delay(nQITRMCAPI100_Session session, double seconds, WriteLock& lock) {
    Wait wait(session);
    struct Delaying {
        ~Delaying() { list.erase(place); }
        std::list<Wait*>& list;
        const std::list<Wait*>::iterator place;
    } const isDelaying{delays, delays.insert(delays.end(), &wait)};
    simulator.waits.spend(wait, seconds, lock);
}

std::int64_t Faults::timeOf(double seconds) const {
    // A time beyond a century counts as never.
    constexpr double century = 100.0 * 366.0 * 24.0 * 60.0 * 60.0;
    return seconds < century ? start + std::llround(seconds * 1e6) : never;
}

Absence Faults::absenceAt(const Device& device, std::int64_t time) const {
    Absence absence = Absence::None;
    for (const DeviceEvent& event : current->events) {
        if (event.device == &device && timeOf(event.begin) <= time && time < timeOf(event.end)) {
            absence = std::max(absence, event.absence);
        }
    }
    return absence;
}

void Faults::catchUp() {
    const std::int64_t now = simulator.clock.now();
    while (due != never && due <= now) {
        passTime(due);
    }
}

void Faults::passTime(std::int64_t time) {
    for (const auto& device : simulator.chassis->devices()) {
        change(*device, absenceAt(*device, time));
    }
    due = never;
    for (const DeviceEvent& event : current->events) {
        for (const std::int64_t next : {timeOf(event.begin), timeOf(event.end)}) {
            due = next > time ? std::min(due, next) : due;
        }
    }
}

void Faults::change(Device& device, Absence absence) {
    if (device.absence == absence) {
        return;
    }
    if (device.absence == Absence::Removed) {
        simulator.reset(device);
    }
    if (absence == Absence::Removed) {
        device.dropAllPending();
    }
    if (absence == Absence::Removed || device.absence == Absence::Removed) {
        ++simulator.chassis->changes;
    }
    simulator.chassis->setAbsence(device, absence);
    const std::int64_t now = simulator.clock.now();
    device.forEachResource(
        [&](const Resource& resource) { simulator.motions.noteChange(resource, now); });
    if (absence != Absence::None) {
        simulator.sessions.forEach([&](Session& session) {
            auto& connected = session.connectedDevices;
            connected.erase(std::remove(connected.begin(), connected.end(), &device),
                            connected.end());
        });
        simulator.waits.endAbout(device);
    }
}

}  // namespace simulator
