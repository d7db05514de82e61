#include "host/Site.h"

#include <utility>

namespace host {

SiteResponse textResponse(int code, const std::string& line) {
    SiteResponse response;
    response.code = code;
    response.type = "text/plain; charset=utf-8";
    response.body = line + "\n";
    response.headers = {{"Cache-Control", "no-store"}};
    return response;
}

SiteResponse refuseMethod(const char* allowed, const char* text) {
    SiteResponse response;
    response.code = 405;
    response.type = "text/plain";
    response.body = text;
    response.headers = {{"Allow", allowed}};
    return response;
}

Site::Site(std::vector<std::unique_ptr<SitePart>> parts, Metrics* metrics)
    : parts(std::move(parts)), counted(metrics) {}

const SitePart* Site::partWith(const std::string& path) const {
    for (const std::unique_ptr<SitePart>& part : parts) {
        if (part->has(path)) {
            return part.get();
        }
    }
    return nullptr;
}

SiteResponse Site::answer(const SiteRequest& request) const {
    return partWith(request.path)->answer(request);
}

}  // namespace host
