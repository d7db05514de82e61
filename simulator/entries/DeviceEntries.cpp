#include <algorithm>

#include "entries/Entry.h"
#include "model/NameText.h"

using namespace simulator;

namespace {

// How long a connection may take when the caller leaves it to the driver.
constexpr double usualConnectTime = 10.0;

bool contains(const std::vector<Device*>& devices, const Device* device) {
    return std::find(devices.begin(), devices.end(), device) != devices.end();
}

void expectAnswers(const std::vector<Device*>& devices, double timeout) {
    std::vector<const Device*> silent;
    std::copy_if(devices.begin(), devices.end(), std::back_inserter(silent),
                 [](const Device* device) {
                     return !device->reachable || device->absence != Absence::None;
                 });
    if (silent.empty()) {
        return;
    }
    Refusal refusal(code::deviceUnreachable);
    refusal.header(term::unreachableDevices);
    for (const Device* device : silent) {
        refusal.usage(tag::device, device->name);
        refusal.cause(Refusal(code::noAnswer).usage(tag::device, device->name));
    }
    refusal.empty().usage(tag::timeout, numberText(timeout));
    throw refusal;
}

// Lets the time pass that the devices need, in parallel.
void spendConnectTime(const std::vector<Device*>& devices, double timeout,
                      nQITRMCAPI100_Session session, Waits& waits, WriteLock& lock) {
    double longest = 0.0;
    for (const Device* device : devices) {
        longest = std::max(longest, device->connectSeconds);
    }
    if (longest > 0.0 && timeout > 0.0) {
        Wait wait(session, &devices);
        waits.spend(wait, std::min(longest, timeout), lock);
    }
    if (longest > timeout) {
        throw Refusal(code::connectTimedOut).usage(tag::timeout, numberText(timeout));
    }
}

void expectFreeName(const Chassis& chassis, const Device& device, std::string_view name) {
    const std::string fault = nameError(name);
    if (!fault.empty()) {
        throw Refusal(code::invalidName)
            .usage(tag::requestedValue, name)
            .usage(tag::explanation, fault);
    }
    const Device* other = chassis.findDevice(name);
    if (other != nullptr && other != &device) {
        throw Refusal(code::nameInUse).usage(tag::device, other->name);
    }
}

}  // namespace

void nQITRMCAPI100_connectToDevices(nQITRMCAPI100_Session session, const char* devices,
                                    double timeout, qierr_Status* status) {
    const auto call = [&, function = __func__] {
        return Call(function).session(session).resources("devices", devices).in("timeout", timeout);
    };
    withSimulator(status, call, [&](Simulator& simulator, WriteLock& lock) {
        Session& owner = simulator.sessions.get(session);
        auto wanted = simulator.resolver(owner).devicesToConnect(required(devices, "devices"));
        const double allowed = timeout < 0.0 ? usualConnectTime : checkedTimeout(timeout);
        const auto isConnected = [&](const Device* device) {
            return contains(owner.connectedDevices, device);
        };
        wanted.erase(std::remove_if(wanted.begin(), wanted.end(), isConnected), wanted.end());
        spendConnectTime(wanted, allowed, session, simulator.waits, lock);
        expectAnswers(wanted, allowed);
        std::copy_if(wanted.begin(), wanted.end(), std::back_inserter(owner.connectedDevices),
                     [&](const Device* device) { return !isConnected(device); });
    });
}

void nQITRMCAPI100_disconnectFromDevices(nQITRMCAPI100_Session session, const char* devices,
                                         qierr_Status* status) {
    const auto call = [&, function = __func__] {
        return Call(function).session(session).resources("devices", devices);
    };
    withSession(session, status, call, [&](Simulator& simulator, Session& owner) {
        std::vector<std::string> notConnected;
        auto& connected = owner.connectedDevices;
        for (Device* device : simulator.resolver(owner).devices(required(devices, "devices"))) {
            if (!contains(connected, device)) {
                notConnected.push_back(device->name);
            }
            connected.erase(std::remove(connected.begin(), connected.end(), device),
                            connected.end());
        }
        if (!notConnected.empty()) {
            throw Refusal(code::notConnected).usage(tag::devices, notConnected);
        }
    });
}

void nQITRMCAPI100_resetDevices(nQITRMCAPI100_Session session, const char* devices,
                                qierr_Status* status) {
    const auto call = [&, function = __func__] {
        return Call(function).session(session).resources("devices", devices);
    };
    withSession(session, status, call, [&](Simulator& simulator, Session& owner) {
        const auto wanted = simulator.resolver(owner).devices(required(devices, "devices"));
        for (const Device* device : wanted) {
            simulator.reservations.expectWritable(session, *device);
        }
        for (Device* device : wanted) {
            simulator.reset(*device);
        }
    });
}

void nQITRMCAPI100_renameDevice(nQITRMCAPI100_Session session, const char* device,
                                const char* newName, qierr_Status* status) {
    const auto call = [&, function = __func__] {
        return Call(function).session(session).resources("device", device).in("newName", newName);
    };
    withSession(session, status, call, [&](Simulator& simulator, Session& owner) {
        Device& found = simulator.resolver(owner).oneDevice(required(device, "device"));
        const std::string name(required(newName, "newName"));
        expectFreeName(*simulator.chassis, found, name);
        simulator.reservations.expectWritable(session, found);
        Change change = simulator.lasting.change();
        change.name(found, name, simulator.chassis->changes + 1);
        simulator.chassis->rename(found, name, [&] { simulator.lasting.keep(change); });
    });
}
