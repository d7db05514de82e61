#include "sessions/Reservations.h"

#include <algorithm>

#include "status/Refusal.h"

namespace simulator {

bool Holding::conflictsWith(const Holding& other) const {
    const bool bothRead = access == readOnlyAccess && other.access == readOnlyAccess;
    const bool sameGroup = !group.empty() && group == other.group;
    return session != other.session && !bothRead && !sameGroup;
}

Reservations::Request::Request(const std::vector<Device*>& devices, const Holding& wanted)
    : devices(devices),
      wanted(wanted),
      holdings(devices.size(), wanted),
      held{{wanted.session, {devices.begin(), devices.end()}}},
      wait(wanted.session, &devices) {}

Reservations::Reservations(const Chassis& chassis, Waits& waits)
    : holders(chassis.devices().size()), waits(waits) {}

bool Reservations::conflictsOn(const Device& device, const Holding& wanted) const {
    const std::list<Holding>& present = holders[device.place];
    return std::any_of(present.begin(), present.end(),
                       [&](const Holding& holding) { return holding.conflictsWith(wanted); });
}

const Holding* Reservations::find(nQITRMCAPI100_Session session, const Device& device) const {
    const std::list<Holding>& present = holders[device.place];
    const auto found = std::find_if(present.begin(), present.end(), [&](const Holding& holding) {
        return holding.session == session;
    });
    return found == present.end() ? nullptr : &*found;
}

bool Reservations::isFree(const Request& request) const {
    return std::none_of(request.devices.begin(), request.devices.end(),
                        [&](const Device* device) { return conflictsOn(*device, request.wanted); });
}

bool Reservations::competes(const Request& earlier, const Request& later) const {
    return earlier.wait.end == Wait::End::None && earlier.wanted.conflictsWith(later.wanted) &&
           std::any_of(earlier.devices.begin(), earlier.devices.end(), [&](const Device* device) {
               return std::find(later.devices.begin(), later.devices.end(), device) !=
                      later.devices.end();
           });
}

bool Reservations::mustQueue(const Request& request) const {
    for (const Request* earlier : queue) {
        if (earlier == &request) {
            return false;
        }
        if (competes(*earlier, request)) {
            return true;
        }
    }
    return false;
}

void Reservations::grant(Request& request) noexcept {
    for (const Device* device : request.devices) {
        std::list<Holding>& present = holders[device->place];
        present.remove_if(
            [&](const Holding& holding) { return holding.session == request.wanted.session; });
        present.splice(present.end(), request.holdings, request.holdings.begin());
    }
    // Moves the entry, or if there is one for the session already, the devices in it.
    held.merge(request.held);
    for (auto& [session, devices] : request.held) {
        held.find(session)->second.merge(devices);
    }
    request.wait.finish(Wait::End::Done);
}

void Reservations::serveQueue() noexcept {
    for (Request* request : queue) {
        if (request->wait.end == Wait::End::None && !mustQueue(*request) && isFree(*request)) {
            grant(*request);
        }
    }
}

void Reservations::refuse(const Request& request) const {
    std::vector<std::string> taken;
    for (const Device* device : request.devices) {
        if (conflictsOn(*device, request.wanted)) {
            taken.push_back(device->name);
        }
    }
    if (taken.size() == 1) {
        throw Refusal(code::deviceReserved).usage(tag::device, taken.front());
    }
    throw Refusal(code::deviceReserved).usage(tag::devices, taken);
}

void Reservations::waitInQueue(Request& request, double timeout, WriteLock& lock) {
    struct InQueue {
        InQueue(Reservations& owner, Request& request)
            : owner(owner), place(owner.queue.insert(owner.queue.end(), &request)) {}
        ~InQueue() {
            owner.queue.erase(place);
            owner.serveQueue();
        }
        Reservations& owner;
        std::list<Request*>::iterator place;
    } const inQueue(*this, request);
    if (!waits.sleep(request.wait, timeout, lock)) {
        if (!isFree(request)) {
            refuse(request);
        }
        grant(request);
    }
}

void Reservations::reserve(const std::vector<Device*>& devices, const Holding& wanted,
                           double timeout, WriteLock& lock) {
    Request request(devices, wanted);
    const bool mayWait = timeout > 0.0;
    if (isFree(request) && !(mayWait && mustQueue(request))) {
        grant(request);
        serveQueue();
    } else if (mayWait) {
        waitInQueue(request, timeout, lock);
    } else {
        refuse(request);
    }
}

void Reservations::removeHolding(nQITRMCAPI100_Session session, const Device& device) noexcept {
    holders[device.place].remove_if(
        [&](const Holding& holding) { return holding.session == session; });
}

bool Reservations::release(nQITRMCAPI100_Session session, const Device& device) {
    const auto ofSession = held.find(session);
    if (ofSession == held.end()) {
        return false;
    }
    auto& devices = ofSession->second;
    const auto place = devices.find(&device);
    if (place == devices.end()) {
        return false;
    }
    devices.erase(place);
    if (devices.empty()) {
        held.erase(ofSession);
    }
    removeHolding(session, device);
    serveQueue();
    return true;
}

void Reservations::releaseAll(nQITRMCAPI100_Session session) {
    const auto ofSession = held.find(session);
    if (ofSession != held.end()) {
        for (const Device* device : ofSession->second) {
            removeHolding(session, *device);
        }
        held.erase(ofSession);
    }
    serveQueue();
}

std::vector<Device*> Reservations::heldBy(nQITRMCAPI100_Session session) const {
    const auto ofSession = held.find(session);
    if (ofSession == held.end()) {
        return {};
    }
    return {ofSession->second.begin(), ofSession->second.end()};
}

void Reservations::expectWritable(nQITRMCAPI100_Session session, const Device& device) const {
    const Holding* held = find(session, device);
    if (held == nullptr && conflictsOn(device, Holding{session, readWriteAccess, ""})) {
        throw Refusal(code::deviceReserved).usage(tag::device, device.name);
    }
    if (held != nullptr && held->access == readOnlyAccess) {
        throw Refusal(code::readOnlyReservation)
            .elaboration(term::notAllowed)
            .usage(tag::device, device.name);
    }
}

}  // namespace simulator
