#include "host/Site.h"

#include <utility>

namespace host {

SiteResponse refuseMethod() {
    SiteResponse response;
    response.code = 405;
    response.type = "text/plain";
    response.body = "This can only be read, with GET.\n";
    response.headers = {{"Allow", "GET, HEAD"}};
    return response;
}

Site::Site(std::vector<std::unique_ptr<SitePart>> parts, Metrics* metrics)
    : parts(std::move(parts)), counted(metrics) {}

const SitePart* Site::partWith(const std::string& path) const {
    for (const std::unique_ptr<SitePart>& part : parts) {
        if (part->has(path))
            return part.get();
    }
    return nullptr;
}

SiteResponse Site::answer(const SiteRequest& request) const {
    return partWith(request.path)->answer(request);
}

}  // namespace host
