#include "support/ModelledSessions.h"

#include <algorithm>
#include <cstdlib>

namespace {

using Reply = RecordingDriver::Reply;

Reply refusal(std::int32_t code) {
    Reply reply;
    reply.code = code;
    return reply;
}

// The first argument of a call.
ModelledSessions::Handle handleIn(const std::string& call) {
    return static_cast<ModelledSessions::Handle>(
        std::strtoul(call.c_str() + call.find('(') + 1, nullptr, 10));
}

// The devices of the resources in an opening call, whose second argument is always 60.
std::vector<std::string> devicesIn(const std::string& call) {
    const std::size_t begin = call.find('"') + 1;
    const std::string names = call.substr(begin, call.rfind("\", 60, ") - begin);
    std::vector<std::string> devices;
    for (std::size_t at = 0; at <= names.size();) {
        const std::size_t comma = std::min(names.find(',', at), names.size());
        const std::string name = names.substr(at, comma - at);
        devices.push_back(name.substr(0, name.find('/')));
        at = comma + 1;
    }
    return devices;
}

}  // namespace

void ModelledSessions::answerCalls() {
    RecordingDriver& driver = RecordingDriver::instance();
    const auto answer = [&](const char* call, std::function<Reply(const std::string&)> workedOut) {
        Reply reply;
        reply.workedOut = std::move(workedOut);
        driver.reply(call, std::move(reply));
    };
    answer("initializeSessionWithoutResources", [this](const auto&) { return openOn({}); });
    for (const char* call : {"initializeSessionWithDevices", "initializeSessionWithPhysChans",
                             "initializeSessionWithNvmemAreas"}) {
        answer(call, [this](const auto& text) { return openOn(devicesIn(text)); });
    }
    answer("closeSession", [this](const auto& text) { return closeOf(text); });
    for (const char* call : {"abortSession", "reserveDevices", "unreserveDevices"}) {
        answer(call, [this](const auto& text) { return check(text); });
    }
    answer("getSessionPropertyStringArray", [this](const auto& text) { return reservedBy(text); });
    const std::string access = "translateStaticEnumStringToValue(\"ReservationAccess\", ";
    driver.give(access + "\"ReadOnly\")", std::int64_t{1});
    driver.give(access + "\"ReadWrite\")", std::int64_t{3});
}

void ModelledSessions::warn(std::int32_t code, std::string json) {
    std::lock_guard<std::mutex> hold(mutex);
    warningCode = code;
    warningText = std::move(json);
}

std::vector<ModelledSessions::Handle> ModelledSessions::open() const {
    std::lock_guard<std::mutex> hold(mutex);
    std::vector<Handle> handles;
    for (const auto& [handle, devices] : sessions) {
        handles.push_back(handle);
    }
    return handles;
}

ModelledSessions::Handle ModelledSessions::opened() const {
    std::lock_guard<std::mutex> hold(mutex);
    return lastHandle;
}

int ModelledSessions::callsForClosedSessions() const {
    std::lock_guard<std::mutex> hold(mutex);
    return strayCalls;
}

Reply ModelledSessions::success(RecordingDriver::Value value) const {
    Reply reply;
    reply.value = std::move(value);
    reply.code = warningCode;
    reply.json = warningText;
    return reply;
}

Reply ModelledSessions::openOn(const Devices& devices) {
    std::lock_guard<std::mutex> hold(mutex);
    for (const std::string& device : devices) {
        if (isReserved(device)) {
            return refusal(deviceReserved);
        }
    }
    sessions[++lastHandle] = devices;
    return success(std::uint64_t{lastHandle});
}

Reply ModelledSessions::closeOf(const std::string& call) {
    const Reply reply = check(call);
    std::lock_guard<std::mutex> hold(mutex);
    sessions.erase(handleIn(call));
    return reply;
}

Reply ModelledSessions::reservedBy(const std::string& call) {
    Reply reply = check(call);
    std::lock_guard<std::mutex> hold(mutex);
    if (reply.code >= 0) {
        reply.value = sessions[handleIn(call)];
    }
    return reply;
}

Reply ModelledSessions::check(const std::string& call) {
    std::lock_guard<std::mutex> hold(mutex);
    if (sessions.count(handleIn(call)) != 0) {
        return success({});
    }
    ++strayCalls;
    return refusal(notOpen);
}

bool ModelledSessions::isReserved(const std::string& device) const {
    return std::any_of(sessions.begin(), sessions.end(), [&](const auto& session) {
        const Devices& held = session.second;
        return std::find(held.begin(), held.end(), device) != held.end();
    });
}
