#pragma once

#include <chrono>
#include <thread>

#include "host/Client.h"
#include "host/Connections.h"
#include "host/Gate.h"
#include "host/ListenSocket.h"
#include "host/OriginPolicy.h"
#include "host/Plugin.h"
#include "host/Site.h"
#include "host/Workers.h"

namespace host {

// The HTTP server. A few threads serve all connections and run the plug-in; while a request lasts,
// another thread serves the other connections, so no client waits for another one's request.
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
    void acceptClients() noexcept;
    void acceptClient() noexcept;

    ListenSocket& socket;
    const ServerSettings settings;
    Connections connections;
    Gate gate;
    const Service service;
    Workers workers;
    std::thread acceptor;
};

}  // namespace host
