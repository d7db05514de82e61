#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "host/Origin.h"

namespace host {

struct Header {
    const char* name;
    std::string value;
};

// What the head of a request says of where it comes from. The texts belong to the caller.
struct Source {
    // Takes in the next header of the request.
    void takeHeader(std::string_view name, std::string_view value);

    std::string_view method;
    std::string_view
        localAddress;  // canonical, of the machine's end of the connection; may be empty
    std::vector<std::string_view> hosts;    // each header "Host"
    std::vector<std::string_view> origins;  // each header "Origin"
    std::string_view wantedMethod;          // what a preflight asks for
    std::string_view wantedHeaders;
};

struct Verdict {
    std::string refusal;          // the text of a 403; empty when the request may pass
    bool isPreflight = false;     // the headers are the whole response
    std::vector<Header> headers;  // of the response
};

// Keeps the pages of foreign web sites from using the host. A browser on the machine reaches the
// host like any program, and sends simple requests of any page without asking first; it says in
// "Origin" what page that is. A site can also give its own name the address of the host (DNS
// rebinding), and then sends that name as "Host". Programs send no "Origin" and an address.
class OriginPolicy {
  public:
    // scheme: the host's own, "http" or "https". hostNames: canonical names of the host besides
    // the loopback ones and the address that a client has connected to. allowedOrigins: what
    // parseOrigin() takes.
    OriginPolicy(std::string scheme, std::vector<std::string> hostNames,
                 const std::vector<std::string>& allowedOrigins);

    Verdict judge(const Source& source) const;

  private:
    std::string refusalOfHost(const Source& source) const;
    bool isOwnHost(const Source& source, const std::string& host) const;
    bool isOwnOrigin(const Source& source, std::string_view origin) const;
    bool isAllowed(std::string_view origin) const;

    const std::string scheme;
    const std::vector<std::string> hostNames;
    std::vector<Origin> allowedOrigins;
};

}  // namespace host
