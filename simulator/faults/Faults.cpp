#include "faults/Faults.h"

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <utility>

#include "description/StartRefusal.h"
#include "faults/FaultReader.h"

namespace simulator {

namespace {

constexpr const char* variable = "QITRMC_SIM_FAULTS";

std::string pathFromEnvironment() {
    const char* path = std::getenv(variable);
    return path != nullptr ? path : "";
}

}  // namespace

Faults::Faults(Chassis& chassis, Sessions& sessions, Waits& waits, const Clock& clock)
    : chassis(chassis),
      sessions(sessions),
      waits(waits),
      clock(clock),
      path(pathFromEnvironment()),
      current(std::make_shared<FaultPlan>()),
      start(clock.now()) {
    waits.follow(*this);
    noteWatching();
    try {
        readFile();
    } catch (const DescriptionFault& fault) {
        refuseStart(path, fault);
    }
}

void Faults::noteWatching() {
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
            throw DescriptionFault{"", "is a pipe, which is read but once",
                                   "QITRMC_SIM_FAULTS must name a file on a disk"};
        }
        const TextFile file = readTextFile(path, "QITRMC_SIM_FAULTS must name a readable file");
        replace(readFaults(file.text, chassis));
        version = file.version;
    } catch (const DescriptionFault&) {
        version = present;
        throw;
    }
}

void Faults::refresh() {
    try {
        readFile();
    } catch (const DescriptionFault& fault) {
        tellFault(path, {fault.pointer, fault.wrong, fault.right + "; the former faults stay"});
    }
    catchUp();
}

void Faults::replace(FaultPlan fresh) {
    auto former = std::make_shared<FaultPlan>(std::move(fresh));
    const int64_t formerStart = std::exchange(start, clock.now());
    current.swap(former);
    due = start;
    try {
        catchUp();
    } catch (...) {
        current.swap(former);
        start = formerStart;
        throw;
    }
    noteWatching();
    for (Wait* wait : delays) {
        wait->finish(Wait::End::done);
    }
    waits.lookAgain();
}

void Faults::delay(nQITRMCAPI100_Session session, double seconds,
                   std::unique_lock<std::mutex>& lock) {
    Wait wait(session);
    struct Delaying {
        ~Delaying() { list.erase(place); }
        std::list<Wait*>& list;
        const std::list<Wait*>::iterator place;
    } const isDelaying{delays, delays.insert(delays.end(), &wait)};
    waits.spend(wait, seconds, lock);
}

int64_t Faults::timeOf(double seconds) const {
    // A time that nobody lives to see is as good as never.
    constexpr double century = 100.0 * 366.0 * 24.0 * 60.0 * 60.0;
    return seconds < century ? start + std::llround(seconds * 1e6) : never;
}

Absence Faults::absenceAt(const Device& device, int64_t time) const {
    Absence absence = Absence::none;
    for (const DeviceEvent& event : current->events) {
        if (event.device == &device && timeOf(event.begin) <= time && time < timeOf(event.end)) {
            absence = std::max(absence, event.absence);
        }
    }
    return absence;
}

void Faults::catchUp() {
    const int64_t now = clock.now();
    while (due != never && due <= now) {
        passTime(due);
    }
}

void Faults::passTime(int64_t time) {
    for (const auto& device : chassis.devices()) {
        change(*device, absenceAt(*device, time));
    }
    due = never;
    for (const DeviceEvent& event : current->events) {
        for (const int64_t next : {timeOf(event.begin), timeOf(event.end)}) {
            due = next > time ? std::min(due, next) : due;
        }
    }
}

void Faults::change(Device& device, Absence absence) {
    if (device.absence == absence) {
        return;
    }
    if (device.absence == Absence::removed) {
        chassis.reset(device, clock.now());
    }
    if (absence == Absence::removed) {
        device.dropAllPending();
    }
    if (absence == Absence::removed || device.absence == Absence::removed) {
        ++chassis.changes;
    }
    device.absence = absence;
    device.forEachResource(
        [&](const Resource& resource) { chassis.life.noteChange(resource, clock.now()); });
    if (absence != Absence::none) {
        sessions.forEach([&](Session& session) {
            auto& connected = session.connectedDevices;
            connected.erase(std::remove(connected.begin(), connected.end(), &device),
                            connected.end());
        });
        waits.endAbout(device);
    }
}

}  // namespace simulator
