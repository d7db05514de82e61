#pragma once

#include <string>

#include "host/Plugin.h"
#include "host/Site.h"

namespace host {

// What is wrong with a plug-in, as a sentence; empty when it answers a request and finds its
// explanation files. Waits for no other request.
std::string faultOf(const Plugin& plugin);

// Whether the service works, for supervisors: at /healthz.
class Health : public SitePart {
  public:
    // The plug-in must outlive this, and be initialized before the first request.
    explicit Health(const Plugin& plugin) : plugin(plugin) {}

    bool has(const std::string& path) const override { return path == "/healthz"; }
    SiteResponse answer(const SiteRequest& request) const override;

  private:
    const Plugin& plugin;
};

}  // namespace host
