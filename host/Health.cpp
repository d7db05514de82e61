#include "host/Health.h"

#include "host/EntryName.h"
#include "host/Request.h"

namespace host {

namespace {

// Not JSON, so that the service answers before it waits for a batch. Its answer takes its sentence
// from the explanation files.
constexpr const char* probe = "{";
constexpr const char* expectedCode = "\"code\":-32700";
constexpr const char* notExplained = "Error description not found";

bool contains(const std::string& text, const char* part) {
    return text.find(part) != std::string::npos;
}

}  // namespace

std::string faultOf(const Plugin& plugin) {
    const std::vector<std::uint32_t> name = {'C', 'a', 'l', 'l'};
    Entry entry(name);
    ws_Request request;
    request.transport = "http";
    request.method = "POST";
    request.body = probe;
    if (!plugin.run(entry, request)) {
        return "The plug-in failed on a request; standard error says why.";
    }
    if (request.code != 200) {
        return "The plug-in answers with HTTP " + std::to_string(request.code) + ": " +
               request.output;
    }
    if (contains(request.output, notExplained)) {
        return "The explanation files of the service are not found. Install them in the shared "
               "directory.";
    }
    if (!contains(request.output, expectedCode)) {
        return "The plug-in does not answer like the service: " + request.output;
    }
    return "";
}

SiteResponse Health::answer(const SiteRequest& request) const {
    if (request.method != "GET" && request.method != "HEAD") {
        return refuseMethod();
    }
    const std::string fault = faultOf(plugin);
    return fault.empty() ? textResponse(200, "The service works.") : textResponse(503, fault);
}

}  // namespace host
