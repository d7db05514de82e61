#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace host {

// A host and a port as URLs and the header "Host" have them. Equal ones compare equal however they
// were written: names are lower case, addresses are in their shortest form without brackets, an
// IPv4 address within IPv6 is an IPv4 address.
struct Authority {
    std::string host;
    std::uint32_t port = 0;

    bool operator==(const Authority& other) const {
        return host == other.host && port == other.port;
    }
};

// Where a web page comes from.
struct Origin {
    std::string scheme;  // lower case
    Authority authority;

    bool operator==(const Origin& other) const {
        return scheme == other.scheme && authority == other.authority;
    }
};

// The host as it stands in an Authority. Takes a name or an address without brackets, nothing else.
std::optional<std::string> canonicalHost(std::string_view text);

// Takes HOST or HOST:PORT, with an IPv6 address in brackets. Without a port it is the one that the
// scheme has by default, 0 where that is unknown.
std::optional<Authority> parseAuthority(std::string_view text, std::string_view scheme);

// Whether an authority as text is this canonical IPv4 address, with or without a port: what the
// programs on a network send. False tells nothing, other texts have to be parsed.
bool isPlainAddress(std::string_view text, std::string_view address);

// Takes SCHEME://HOST or SCHEME://HOST:PORT. "null" is no such origin.
std::optional<Origin> parseOrigin(std::string_view text);

// Whether the host is a name or address at which a machine reaches nothing but itself.
bool isLoopback(const std::string& canonicalHost);

// The host of the socket's own end, empty when it cannot be told.
std::string localAddress(int socket);

// The host of the other end.
std::string remoteAddress(int socket);

}  // namespace host
