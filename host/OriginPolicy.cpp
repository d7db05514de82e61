#include "host/OriginPolicy.h"

#include <strings.h>

#include <algorithm>
#include <utility>

namespace host {

namespace {

// How many seconds a browser may rely on a preflight.
constexpr const char* preflightLifetime = "600";

bool contains(const std::vector<std::string>& list, const std::string& text) {
    return std::find(list.begin(), list.end(), text) != list.end();
}

std::string foreignOriginText(std::string_view text) {
    const std::string origin(text);
    if (!parseOrigin(origin)) {
        return "Requests with the Origin \"" + origin +
               "\" are not taken. Serve the page from a web server, and start the host with "
               "--allow-origin and the origin of that server.\n";
    }
    return "Requests of web pages from " + origin +
           " are not taken. To take them, start the host with --allow-origin " + origin + ".\n";
}

std::vector<Header> headersFor(std::string_view origin) {
    return {{"Access-Control-Allow-Origin", std::string(origin)}, {"Vary", "Origin"}};
}

void addPreflightHeaders(std::vector<Header>& headers, const Source& source) {
    headers.push_back({"Access-Control-Allow-Methods", "POST"});
    headers.push_back(
        {"Access-Control-Allow-Headers",
         std::string(source.wantedHeaders.empty() ? "Content-Type" : source.wantedHeaders)});
    headers.push_back({"Access-Control-Max-Age", preflightLifetime});
}

Verdict refuse(const std::string& text) {
    Verdict verdict;
    verdict.refusal = text;
    return verdict;
}

}  // namespace

void Source::takeHeader(std::string_view name, std::string_view value) {
    const auto isNamed = [&](std::string_view other) {
        return name.size() == other.size() &&
               strncasecmp(name.data(), other.data(), other.size()) == 0;
    };
    if (isNamed("Host")) {
        hosts.emplace_back(value);
    } else if (isNamed("Origin")) {
        origins.emplace_back(value);
    } else if (isNamed("Access-Control-Request-Method")) {
        wantedMethod = value;
    } else if (isNamed("Access-Control-Request-Headers")) {
        wantedHeaders = value;
    }
}

OriginPolicy::OriginPolicy(std::string scheme, std::vector<std::string> hostNames,
                           const std::vector<std::string>& allowed)
    : scheme(std::move(scheme)), hostNames(std::move(hostNames)) {
    for (const std::string& origin : allowed) {
        allowedOrigins.push_back(parseOrigin(origin).value());
    }
}

Verdict OriginPolicy::judge(const Source& source) const {
    if (source.hosts.size() > 1 || source.origins.size() > 1) {
        return refuse("A request has one Host and at most one Origin.\n");
    }
    const std::string refusal = refusalOfHost(source);
    if (!refusal.empty()) {
        return refuse(refusal);
    }
    if (source.origins.empty()) {
        return {};
    }
    const std::string_view origin = source.origins.front();
    if (!isAllowed(origin)) {
        return isOwnOrigin(source, origin) ? Verdict() : refuse(foreignOriginText(origin));
    }
    Verdict verdict;
    verdict.headers = headersFor(origin);
    verdict.isPreflight = source.method == "OPTIONS" && !source.wantedMethod.empty();
    if (verdict.isPreflight) {
        addPreflightHeaders(verdict.headers, source);
    }
    return verdict;
}

// Only clients of HTTP/1.0 that are no browsers send no host.
std::string OriginPolicy::refusalOfHost(const Source& source) const {
    if (source.hosts.empty() || isPlainAddress(source.hosts.front(), source.localAddress)) {
        return "";
    }
    const std::optional<Authority> authority = parseAuthority(source.hosts.front(), scheme);
    if (!authority) {
        return "The Host \"" + std::string(source.hosts.front()) +
               "\" is not a name or address. Send the one that stands in the URL.\n";
    }
    if (isOwnHost(source, authority->host)) {
        return "";
    }
    return "Requests to the host name " + authority->host +
           " are not taken. Use an address of this machine, or start the host with --host-name " +
           authority->host + ".\n";
}

// The port does not count: a forwarded one differs.
bool OriginPolicy::isOwnHost(const Source& source, const std::string& host) const {
    return isLoopback(host) || host == source.localAddress || contains(hostNames, host);
}

// The host of the request is known to be the own one.
bool OriginPolicy::isOwnOrigin(const Source& source, std::string_view text) const {
    const std::optional<Origin> origin = parseOrigin(text);
    return origin && !source.hosts.empty() && origin->scheme == scheme &&
           origin->authority == parseAuthority(source.hosts.front(), scheme);
}

bool OriginPolicy::isAllowed(std::string_view text) const {
    const std::optional<Origin> origin = parseOrigin(text);
    return origin &&
           std::find(allowedOrigins.begin(), allowedOrigins.end(), *origin) != allowedOrigins.end();
}

}  // namespace host
