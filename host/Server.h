#pragma once

#include <chrono>
#include <cstdint>
#include <memory>
#include <string>
#include <thread>

#include "host/Connections.h"
#include "host/Gate.h"
#include "host/ListenSocket.h"
#include "host/OriginPolicy.h"
#include "host/Plugin.h"
#include "host/Site.h"

struct MHD_Daemon;

namespace host {

struct ServerSettings {
    std::uint32_t threads = 0;  // most connections at once
    std::uint32_t maxBody = 0;  // bytes
    std::uint32_t timeout = 0;  // seconds
    bool tls = false;           // HTTPS with these two, both PEM text
    std::string tlsCertificate;
    std::string tlsKey;
    bool passTransport = false;  // the plug-in sees "https" behind TLS, else always "http"
};

// The HTTP server. Each connection has a thread, which also runs the plug-in, so no client waits
// for another one's request.
class Server {
  public:
    // Starts to serve. The plug-in, the socket, the policy and the site must outlive the server.
    // Throws Failure.
    Server(const Plugin& plugin, ListenSocket& socket, ServerSettings settings,
           const OriginPolicy& policy, const Site& site);

    // Cuts the connections that are left. Returns when no request is in the plug-in any more.
    ~Server();
    Server(const Server&) = delete;
    Server& operator=(const Server&) = delete;

    // Shuts connections whose clients take too long. To be called about once a second.
    void shutOverdueConnections() noexcept;

    // Takes no more connections and no more requests on those that are open.
    void stopAccepting();

    // Waits for the requests in flight to end; false when the time runs out before that.
    bool waitForRequests(std::chrono::milliseconds time);

  private:
    struct Callbacks;

    MHD_Daemon* startDaemon();
    void acceptClients() noexcept;

    const Plugin& plugin;
    ListenSocket& socket;
    const ServerSettings settings;
    const OriginPolicy& policy;
    const Site& site;
    Connections connections;
    Gate gate;
    std::unique_ptr<MHD_Daemon, void (*)(MHD_Daemon*)> daemon;
    std::thread acceptor;
};

}  // namespace host
