#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "host/Gate.h"
#include "host/Metrics.h"
#include "host/OriginPolicy.h"
#include "host/Plugin.h"
#include "host/Request.h"
#include "host/Site.h"

namespace host {

// One request on its way through the host: its head, its body piece by piece, the work of the
// plug-in, the response. Used by one thread at a time. Any function may throw std::bad_alloc.
//
// A request that the host answers by itself still has its body read, and thrown away: a client that
// is cut off while it writes would often never see the response.
class Exchange {
  public:
    // maxBody: the most bytes of body that are kept. site: what the host serves besides the
    // service, and where it counts; null for nothing. It must outlive the exchange.
    Exchange(Gate& gate, std::uint32_t maxBody, const Site* site = nullptr) noexcept;
    ~Exchange();
    Exchange(const Exchange&) = delete;
    Exchange& operator=(const Exchange&) = delete;

    // Takes in what the policy says, before the head.
    void admit(Verdict verdict);

    // Takes in the head. declaredLength: the value of the header "Content-Length", null without it.
    void begin(const char* transport, const char* method, std::string_view path,
               const char* declaredLength);

    // Whether the site answers, which then needs describeToSite() too.
    bool isForSite() const { return siteRequest.has_value(); }

    // Takes in what else the site wants to know. knownTag: the value of the header "If-None-Match",
    // null without it. isLocal: whether the client is at a loopback address.
    void describeToSite(const char* knownTag, bool isLocal);

    // Takes in the next piece of the body. False when the client has sent so much beyond the limit
    // that the connection is to be dropped.
    bool take(const char* data, std::size_t size);

    // Has the plug-in or the site serve the request, unless the host has answered it.
    void run(const Plugin& plugin);

    // Whether the host has its response already, without the plug-in.
    bool isAnswered() const { return answered; }

    // The response; complete after run(), or once the request is answered.
    const ws_Request& response() const { return request; }

    // What the response has besides that.
    const std::vector<Header>& headers() const { return responseHeaders; }

  private:
    void answer(int code, std::string_view text);
    void runPlugin(const Plugin& plugin);
    Outcome outcome() const;
    void answerFromSite();
    void refuseBody();
    void fail();

    Gate& gate;
    const bool admitted;
    const std::uint32_t maxBody;
    const Site* const site;
    Metrics* const metrics;                  // null for not counting
    std::optional<SiteRequest> siteRequest;  // of a request that the site answers
    ws_Request request;
    std::vector<std::uint32_t> entryName;
    std::vector<Header> responseHeaders;
    std::size_t discarded = 0;
    bool answered = false;
    bool ranPlugin = false;
};

}  // namespace host
