#pragma once

#include <memory>
#include <string>
#include <vector>

#include "host/OriginPolicy.h"

namespace host {

// A request for something that the host has besides the service.
struct SiteRequest {
    std::string method;
    std::string path;           // without query; escapes as they came
    std::string knownTag = "";  // the header "If-None-Match"
    bool isLocal = false;       // the client is on this machine, at a loopback address
    std::string body = "";
};

struct SiteResponse {
    int code = 200;
    std::string type;  // empty: none
    std::string body;
    std::vector<Header> headers;
};

// A response with a line of text.
SiteResponse textResponse(int code, const std::string& line);

// The response to a method that the part does not take. allowed: those that it does take.
SiteResponse refuseMethod(const char* allowed = "GET, HEAD",
                          const char* text = "This can only be read, with GET.\n");

// One thing that the host serves besides the service. All functions may be called from any thread.
class SitePart {
  public:
    virtual ~SitePart() = default;

    virtual bool has(const std::string& path) const = 0;

    // The response to a request for a path that the part has.
    virtual SiteResponse answer(const SiteRequest& request) const = 0;
};

class Metrics;

// What the host serves besides the service. All functions may be called from any thread.
class Site {
  public:
    // When several parts have a path, the first of them answers. metrics: what the host counts in;
    // null for not counting. It must outlive the site.
    explicit Site(std::vector<std::unique_ptr<SitePart>> parts, Metrics* metrics = nullptr);

    bool has(const std::string& path) const { return partWith(path) != nullptr; }

    // The response to a request for a path that the site has.
    SiteResponse answer(const SiteRequest& request) const;

    Metrics* metrics() const { return counted; }

  private:
    const SitePart* partWith(const std::string& path) const;

    const std::vector<std::unique_ptr<SitePart>> parts;
    Metrics* const counted;
};

}  // namespace host
