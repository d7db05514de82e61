#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "host/OriginPolicy.h"
#include "host/StaticFiles.h"

namespace host {

// A request for something that the host has besides the service.
struct SiteRequest {
    std::string method;
    std::string path;      // without query; escapes as they came
    std::string knownTag;  // the header "If-None-Match"
};

struct SiteResponse {
    int code = 200;
    std::string type;  // empty: none
    std::string body;
    std::vector<Header> headers;
};

// What the host serves besides the service: the page in a browser. All functions may be called from
// any thread.
class Site {
  public:
    explicit Site(StaticFiles files);

    bool has(const std::string& path) const;

    // The response to a request for a path that the site has.
    SiteResponse answer(const SiteRequest& request) const;

    // Whether there is something to look at with a browser.
    bool hasPage() const { return has("/"); }

  private:
    const StaticFiles files;
};

}  // namespace host
