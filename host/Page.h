#pragma once

#include "host/Site.h"
#include "host/StaticFiles.h"

namespace host {

// The page for a browser: files that can be read.
class Page : public SitePart {
  public:
    explicit Page(StaticFiles files);

    bool has(const std::string& path) const override;
    SiteResponse answer(const SiteRequest& request) const override;

  private:
    const StaticFiles files;
};

}  // namespace host
