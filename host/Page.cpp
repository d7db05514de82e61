#include "host/Page.h"

#include <utility>

namespace host {

namespace {

// Everything that the page is made of comes from here. It sets styles from its program, never in
// its markup, and makes pictures in memory.
constexpr const char* contentPolicy =
    "default-src 'none'; script-src 'self'; style-src 'self'; img-src 'self' data: blob:; "
    "connect-src 'self'; base-uri 'none'; form-action 'none'; frame-ancestors 'none'";

constexpr const char* lasting = "public, max-age=31536000, immutable";
constexpr const char* askEachTime = "no-cache";

// The header is a list of tags, or "*" for any.
bool isKnown(const std::string& knownTags, const std::string& tag) {
    return knownTags == "*" || knownTags.find(tag) != std::string::npos;
}

SiteResponse answerWithFile(const StaticFile& file, const std::string& knownTags) {
    SiteResponse response;
    response.headers = {{"ETag", file.tag},
                        {"Cache-Control", file.isLasting ? lasting : askEachTime},
                        {"Content-Security-Policy", contentPolicy},
                        {"X-Content-Type-Options", "nosniff"},
                        {"Referrer-Policy", "no-referrer"}};
    if (isKnown(knownTags, file.tag)) {
        response.code = 304;
        return response;
    }
    response.type = file.type;
    response.body = file.content;
    return response;
}

}  // namespace

Page::Page(StaticFiles files) : files(std::move(files)) {}

bool Page::has(const std::string& path) const {
    return files.find(path) != nullptr;
}

SiteResponse Page::answer(const SiteRequest& request) const {
    if (request.method != "GET" && request.method != "HEAD") {
        return refuseMethod();
    }
    return answerWithFile(*files.find(request.path), request.knownTag);
}

}  // namespace host
