#include "host/SimulatorPanel.h"

#include <charconv>
#include <optional>
#include <string_view>
#include <utility>

#include "host/SimulatedDriver.h"

namespace host {

namespace {

constexpr const char* devicesPath = "/simulator/devices";
constexpr const char* faultsPath = "/simulator/faults";
constexpr std::string_view tracePath = "/simulator/trace/";

template <typename Function>
Function function(const char* name) {
    return reinterpret_cast<Function>(driverFunction(name));
}

// The number at the end of the path of a trace; nothing for another path.
std::optional<std::uint64_t> traceNumber(const std::string& path) {
    if (path.rfind(tracePath, 0) != 0) {
        return std::nullopt;
    }
    std::uint64_t number = 0;
    const char* end = path.data() + path.size();
    const auto [stop, error] = std::from_chars(path.data() + tracePath.size(), end, number);
    return error == std::errc() && stop == end ? std::optional<std::uint64_t>(number)
                                               : std::nullopt;
}

}  // namespace

std::unique_ptr<SitePart> SimulatorPanel::find() {
    std::unique_ptr<SimulatorPanel> panel(new SimulatorPanel());
    return panel->describeDevices == nullptr ? nullptr : std::move(panel);
}

SimulatorPanel::SimulatorPanel()
    : freeString(function<decltype(freeString)>("nQITRMCAPI100_freeString")),
      describeDevices(function<decltype(describeDevices)>("qitrmcsim_describeDevices")),
      getFaults(function<decltype(getFaults)>("qitrmcsim_getFaults")),
      replaceFaults(function<decltype(replaceFaults)>("qitrmcsim_setFaults")),
      readTrace(function<decltype(readTrace)>("qitrmcsim_readTrace")) {}

bool SimulatorPanel::has(const std::string& path) const {
    return path == devicesPath || path == faultsPath || traceNumber(path).has_value();
}

SiteResponse SimulatorPanel::answer(const SiteRequest& request) const {
    if (!request.isLocal) {
        return textResponse(403, "The simulated chassis is changed from its own machine alone.");
    }
    if (request.method == "GET" || request.method == "HEAD") {
        return read(request.path);
    }
    if (request.path != faultsPath) {
        return refuseMethod();
    }
    if (request.method != "POST") {
        return refuseMethod("GET, HEAD, POST", "Faults are read with GET and set with POST.\n");
    }
    return setFaults(request.body);
}

SiteResponse SimulatorPanel::read(const std::string& path) const {
    char* json = nullptr;
    std::int32_t code = 0;
    if (path == devicesPath) {
        code = describeDevices(&json);
    } else if (path == faultsPath) {
        code = getFaults(&json);
    } else {
        code = readTrace(*traceNumber(path), &json);
    }
    return respond(code, json);
}

SiteResponse SimulatorPanel::respond(std::int32_t code, char* json) const {
    const std::unique_ptr<char, decltype(freeString)> owner(json, freeString);
    if (code != 0) {
        return textResponse(500, "The simulated chassis failed: " + std::to_string(code) + ".");
    }
    SiteResponse response;
    response.type = "application/json; charset=utf-8";
    response.body = json;
    response.headers = {{"Cache-Control", "no-store"}};
    return response;
}

SiteResponse SimulatorPanel::setFaults(const std::string& json) const {
    char* reason = nullptr;
    const std::int32_t code = replaceFaults(json.c_str(), &reason);
    const std::unique_ptr<char, decltype(freeString)> owner(reason, freeString);
    if (code != 0) {
        return textResponse(400, reason != nullptr ? reason : std::to_string(code));
    }
    SiteResponse response;
    response.code = 204;
    return response;
}

}  // namespace host
