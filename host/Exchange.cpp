#include "host/Exchange.h"

#include <algorithm>
#include <chrono>
#include <cstdlib>
#include <new>
#include <utility>

#include "host/EntryName.h"
#include "host/RequestTarget.h"
#include "host/RpcError.h"
#include "host/openRpcDocument.h"

namespace host {

namespace {

// Far more than a client has under way by mistake.
constexpr std::size_t mostDiscarded = 64 * 1024 * 1024;

constexpr std::string_view documentPath = "/openrpc.json";

bool isGet(std::string_view method) {
    return method == "GET" || method == "HEAD";
}

bool isSendable(const ws_Request& response) {
    return !response.incomplete && response.code >= 200 && response.code <= 599 &&
           std::none_of(response.type.begin(), response.type.end(),
                        [](char c) { return c == '\r' || c == '\n' || c == '\t'; });
}

}  // namespace

Exchange::Exchange(Gate& gate, std::uint32_t maxBody, const Site* site) noexcept
    : gate(gate),
      admitted(gate.enter()),
      maxBody(maxBody),
      site(site),
      metrics(site == nullptr ? nullptr : site->metrics()) {
    if (metrics != nullptr) {
        metrics->countBegunRequest();
    }
}

Exchange::~Exchange() {
    if (metrics != nullptr) {
        metrics->countSentBytes(request.output.size());
        metrics->countEndedRequest(ranPlugin ? Handler::Service : Handler::Host, outcome());
    }
    if (admitted) {
        gate.leave();
    }
}

void Exchange::admit(Verdict verdict) {
    responseHeaders = std::move(verdict.headers);
    if (!verdict.refusal.empty()) {
        return answer(403, verdict.refusal);
    }
    if (!verdict.isPreflight) {
        return;
    }
    answer(204, "");
    request.type.clear();
}

void Exchange::begin(const char* transport, const char* method, std::string_view path,
                     const char* declaredLength) {
    if (answered) {
        return;
    }
    if (!admitted) {
        return answer(503, "The server is stopping.\n");
    }
    if (path == documentPath && isGet(method)) {
        answer(200, openRpcDocument);
        request.type = "application/json; charset=utf-8";
        return;
    }
    std::optional<std::vector<std::uint32_t>> name = entryNameOfPath(path);
    if (!name && site != nullptr && site->has(std::string(pathOfTarget(path)))) {
        siteRequest = SiteRequest{method, std::string(pathOfTarget(path))};
    } else if (!name) {
        return answer(404, "There is nothing here. The service is at /qitrmc/Call.\n");
    }
    if (declaredLength != nullptr && std::strtoull(declaredLength, nullptr, 10) > maxBody) {
        return refuseBody();
    }
    if (name) {
        entryName = std::move(*name);
    }
    request.transport = transport;
    request.method = method;
}

void Exchange::describeToSite(const char* knownTag, bool isLocal) {
    siteRequest->knownTag = knownTag == nullptr ? "" : knownTag;
    siteRequest->isLocal = isLocal;
}

bool Exchange::take(const char* data, std::size_t size) {
    if (metrics != nullptr) {
        metrics->countReceivedBytes(size);
    }
    if (!answered && size > maxBody - request.body.size()) {
        refuseBody();
    }
    if (answered) {
        discarded += size;
        return discarded <= mostDiscarded;
    }
    try {
        request.body.append(data, size);
    } catch (const std::bad_alloc&) {
        fail();
    }
    return true;
}

void Exchange::run(const Plugin& plugin) {
    if (answered) {
        return;
    }
    if (siteRequest) {
        return answerFromSite();
    }
    runPlugin(plugin);
}

void Exchange::runPlugin(const Plugin& plugin) {
    const auto begin = std::chrono::steady_clock::now();
    ranPlugin = true;
    Entry entry(entryName);
    if (!plugin.run(entry, request) || !isSendable(request)) {
        fail();
    }
    if (metrics != nullptr) {
        metrics->countTime(std::chrono::steady_clock::now() - begin);
    }
}

Outcome Exchange::outcome() const {
    if (!answered && !ranPlugin) {
        return Outcome::Aborted;
    }
    if (request.code >= 400) {
        return Outcome::HttpError;
    }
    return ranPlugin && hasRpcError(request.output) ? Outcome::RpcError : Outcome::Ok;
}

void Exchange::answer(int code, std::string_view text) {
    answered = true;
    request = ws_Request();
    request.code = code;
    request.output = text;
}

void Exchange::answerFromSite() {
    siteRequest->body = std::move(request.body);
    SiteResponse response = site->answer(*siteRequest);
    answer(response.code, response.body);
    request.type = response.type;
    for (Header& header : response.headers) {
        responseHeaders.push_back(std::move(header));
    }
}

void Exchange::refuseBody() {
    answer(413, "The request body is too large: at most " + std::to_string(maxBody) +
                    " bytes are taken.\n");
}

void Exchange::fail() {
    answer(500, "The service failed on this request.\n");
}

}  // namespace host
