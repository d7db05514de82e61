#include "host/Origin.h"

#include <arpa/inet.h>
#include <netdb.h>
#include <sys/socket.h>

#include <algorithm>
#include <charconv>
#include <cstring>

namespace host {

namespace {

// Whatever the locale says.
std::string lowerCase(std::string_view text) {
    std::string lower(text);
    for (char& c : lower) {
        c = c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
    }
    return lower;
}

// Whether there are only small letters, digits and these further characters.
bool consistsOfLettersAnd(std::string_view further, std::string_view text) {
    return !text.empty() && std::all_of(text.begin(), text.end(), [&](char c) {
        return (c >= 'a' && c <= 'z') || (c >= '0' && c <= '9') || further.find(c) != further.npos;
    });
}

std::optional<std::string> canonicalIpv6(const std::string& text) {
    in6_addr address;
    if (inet_pton(AF_INET6, text.c_str(), &address) != 1) {
        return std::nullopt;
    }
    char canonical[INET6_ADDRSTRLEN] = "";
    if (IN6_IS_ADDR_V4MAPPED(&address)) {
        inet_ntop(AF_INET, &address.s6_addr[12], canonical, sizeof canonical);
    } else {
        inet_ntop(AF_INET6, &address, canonical, sizeof canonical);
    }
    return canonical;
}

std::optional<std::uint32_t> parsePort(std::string_view text) {
    std::uint32_t port = 0;
    const auto [stop, error] = std::from_chars(text.data(), text.data() + text.size(), port);
    if (error != std::errc() || stop != text.data() + text.size() || port > 65535) {
        return std::nullopt;
    }
    return port;
}

std::uint32_t defaultPort(std::string_view scheme) {
    if (scheme == "http") {
        return 80;
    }
    return scheme == "https" ? 443 : 0;
}

// The part of an authority in front of the port, and the port with its colon.
struct Parts {
    std::string_view host;
    std::string_view port;
};

Parts partsOf(std::string_view text) {
    const std::size_t bracket = text.find(']');
    const std::size_t colon = text.find(':', bracket == text.npos ? 0 : bracket);
    return {text.substr(0, colon), text.substr(std::min(colon, text.size()))};
}

}  // namespace

std::optional<std::string> canonicalHost(std::string_view text) {
    const std::string host = lowerCase(text);
    if (host.find(':') != host.npos) {
        return canonicalIpv6(host);
    }
    return consistsOfLettersAnd("-._", host) ? std::optional(host) : std::nullopt;
}

std::optional<Authority> parseAuthority(std::string_view text, std::string_view scheme) {
    auto [host, port] = partsOf(text);
    const bool bracketed = host.size() > 2 && host.front() == '[' && host.back() == ']';
    if (bracketed) {
        host = host.substr(1, host.size() - 2);
    }
    if (bracketed != (host.find(':') != host.npos)) {
        return std::nullopt;
    }
    const std::optional<std::string> name = canonicalHost(host);
    const std::optional<std::uint32_t> number =
        port.size() < 2 ? defaultPort(scheme) : parsePort(port.substr(1));
    if (!name || !number) {
        return std::nullopt;
    }
    return Authority{*name, *number};
}

bool isPlainAddress(std::string_view text, std::string_view address) {
    const bool isIpv4 = !address.empty() && address.find(':') == address.npos;
    if (!isIpv4 || text.substr(0, address.size()) != address) {
        return false;
    }
    const std::string_view port = text.substr(address.size());
    return port.empty() || (port.front() == ':' && parsePort(port.substr(1)).has_value());
}

std::optional<Origin> parseOrigin(std::string_view text) {
    const std::size_t end = text.find("://");
    if (end == text.npos) {
        return std::nullopt;
    }
    const std::string scheme = lowerCase(text.substr(0, end));
    const std::optional<Authority> authority = parseAuthority(text.substr(end + 3), scheme);
    if (!authority || !consistsOfLettersAnd("+-.", scheme)) {
        return std::nullopt;
    }
    return Origin{scheme, *authority};
}

bool isLoopback(const std::string& canonicalHost) {
    in_addr address;
    if (inet_pton(AF_INET, canonicalHost.c_str(), &address) == 1) {
        return ntohl(address.s_addr) >> 24 == 127;
    }
    return canonicalHost == "localhost" || canonicalHost == "::1";
}

namespace {

// get: getsockname or getpeername.
std::string addressFrom(int (*get)(int, sockaddr*, socklen_t*), int socket) {
    sockaddr_storage address = {};
    socklen_t length = sizeof address;
    char host[NI_MAXHOST] = "";
    get(socket, reinterpret_cast<sockaddr*>(&address), &length);
    getnameinfo(reinterpret_cast<const sockaddr*>(&address), length, host, sizeof host, nullptr, 0,
                NI_NUMERICHOST);
    // A link-local address comes with the name of its interface, which no client sends.
    return canonicalHost(std::string_view(host, std::strcspn(host, "%"))).value_or("");
}

}  // namespace

std::string localAddress(int socket) {
    return addressFrom(getsockname, socket);
}

std::string remoteAddress(int socket) {
    return addressFrom(getpeername, socket);
}

}  // namespace host
