#include <algorithm>

#include "description/Nearest.h"
#include "entries/Attributes.h"
#include "entries/TypedValues.h"
#include "sessions/CommandRun.h"

using namespace simulator;

namespace {

[[noreturn]] void refuseUnknown(std::string_view command, const Resource& resource) {
    Refusal refusal(code::unknownCommand);
    refusal.usage(tag::command, command).usage(tag::resource, resource.fullName());
    std::vector<std::string> known;
    for (const Command& other : resource.commands) {
        known.push_back(other.name);
    }
    if (const std::string* nearest = nearestName(command, known)) {
        refusal.usage(tag::nearestName, *nearest);
    }
    throw refusal;
}

// One task for each resource, however often it is named.
std::vector<Task> findTasks(const Resolver& resolver, std::string_view resources,
                            std::string_view command) {
    const auto found = resolver.anyResources(resources);
    expectSome(found);
    std::vector<Task> tasks;
    for (Resource* resource : found) {
        Command* known = resource->command(command);
        if (known == nullptr) {
            refuseUnknown(command, *resource);
        }
        const auto isSame = [&](const Task& task) { return task.resource == resource; };
        if (std::none_of(tasks.begin(), tasks.end(), isSame)) {
            tasks.push_back({resource, known});
        }
    }
    return tasks;
}

// Marks resources as busy during its lifetime.
class BusyMark {
  public:
    explicit BusyMark(const std::vector<Task>& tasks) : tasks(tasks) { mark(true); }
    BusyMark(const BusyMark&) = delete;
    BusyMark& operator=(const BusyMark&) = delete;
    ~BusyMark() { mark(false); }

  private:
    void mark(bool busy) {
        for (const Task& task : tasks) {
            task.resource->busy = busy;
        }
    }

    const std::vector<Task>& tasks;
};

std::vector<Device*> devicesOf(const std::vector<Task>& tasks) {
    std::vector<Device*> devices;
    for (const Task& task : tasks) {
        devices.push_back(task.resource->device);
    }
    return devices;
}

// Lets the time of the commands pass; they run in parallel.
void spendTime(const std::vector<Task>& tasks, double timeout, nQITRMCAPI100_Session session,
               Waits& waits, WriteLock& lock) {
    double longest = 0.0;
    for (const Task& task : tasks) {
        longest = std::max(longest, task.command->seconds);
    }
    if (longest > 0.0 && timeout > 0.0) {
        const auto devices = devicesOf(tasks);
        Wait wait(session, &devices);
        waits.spend(wait, std::min(longest, timeout), lock);
    }
    if (longest > timeout) {
        throw Refusal(code::commandTimedOut)
            .usage(tag::command, tasks.front().command->name)
            .usage(tag::timeout, numberText(timeout));
    }
}

}  // namespace

void nQITRMCAPI100_executeGenericCommand(nQITRMCAPI100_Session session, const char* resources,
                                         const char* command, double timeout,
                                         qierr_Status* status) {
    const auto call = [&, function = __func__] {
        return Call(function)
            .session(session)
            .resources("resources", resources)
            .in("command", command)
            .in("timeout", timeout);
    };
    withSimulator(status, call, [&](Simulator& simulator, WriteLock& lock) {
        const Session& owner = simulator.sessions.get(session);
        const auto tasks = findTasks(simulator.resolver(owner), required(resources, "resources"),
                                     required(command, "command"));
        const double allowed = checkedTimeout(timeout);
        for (const Task& task : tasks) {
            expectReady(*task.resource, simulator, session);
        }
        const BusyMark busyMark(tasks);
        spendTime(tasks, allowed, session, simulator.waits, lock);
        if (const Refusal* warning = finish(tasks, simulator)) {
            report(*warning, *status);
        }
    });
}

void nQITRMCAPI100_openGenericCommand(nQITRMCAPI100_Session session, const char* resources,
                                      const char* command, nQITRMCAPI100_Command* handle,
                                      qierr_Status* status) {
    clearOutputs(status, handle);
    const auto call = [&, function = __func__] {
        return Call(function)
            .session(session)
            .resources("resources", resources)
            .in("command", command)
            .out("handle", handle);
    };
    withSharedSession(session, status, call, [&](Simulator& simulator, Session& owner) {
        const auto tasks = findTasks(simulator.resolver(owner), required(resources, "resources"),
                                     required(command, "command"));
        *handle = simulator.openCommands.add({session, tasks.front().command});
    });
}

void nQITRMCAPI100_closeCommand(nQITRMCAPI100_Command handle, qierr_Status* status) {
    const auto call = [&, function = __func__] { return Call(function).in("handle", handle); };
    withSharedSimulator(status, call, [&](Simulator& simulator) {
        if (!simulator.openCommands.remove(handle)) {
            throw Refusal(code::unknownHandle).usage(tag::handle, handle);
        }
    });
}

void nQITRMCAPI100_getCommandPropertyString(nQITRMCAPI100_Command handle, const char* attribute,
                                            char** value, qierr_Status* status) {
    clearOutputs(status, value);
    const auto call = [&, function = __func__] {
        return Call(function).in("handle", handle).in("attribute", attribute).out("value", value);
    };
    withSharedSimulator(status, call, [&](Simulator& simulator) {
        const auto open = simulator.openCommands.find(handle);
        if (!open) {
            throw Refusal(code::unknownHandle).usage(tag::handle, handle);
        }
        *value = lendText(simulator::attribute(*open->command, required(attribute, "attribute")));
    });
}
