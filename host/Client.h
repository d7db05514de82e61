#pragma once

#include <sys/socket.h>

#include <cstdint>
#include <string>

#include "host/Connections.h"
#include "host/Gate.h"
#include "host/OriginPolicy.h"
#include "host/Plugin.h"
#include "host/Site.h"
#include "host/Workers.h"

struct MHD_Daemon;

namespace host {

struct ServerSettings {
    std::uint32_t threads = 0;      // most requests at once
    std::uint32_t connections = 0;  // most at once
    std::uint32_t maxBody = 0;      // bytes
    std::uint32_t timeout = 0;      // seconds
    bool tls = false;               // HTTPS with these two, both PEM text
    std::string tlsCertificate;
    std::string tlsKey;
    bool passTransport = false;  // the plug-in sees "https" behind TLS, else always "http"
};

// What serves the requests of all clients.
struct Service {
    const Plugin& plugin;
    const ServerSettings& settings;
    const OriginPolicy& policy;
    const Site& site;
    Connections& connections;
    Gate& gate;
};

// The connection of one client. The HTTP library has an instance of its own for each: one thread at
// a time serves an instance and runs the plug-in for it, so only a connection with an instance of
// its own leaves the others free while a request lasts. The instance is made when the client sends
// something, which keeps connections cheap that are only open.
class Client : public Watched {
  public:
    // Takes over the socket. The service must outlive the client. Throws std::bad_alloc; the socket
    // then stays the caller's.
    Client(const Service& service, int socket, const sockaddr_storage& address, socklen_t length);

    // Ends the connection.
    ~Client() override;
    Client(const Client&) = delete;
    Client& operator=(const Client&) = delete;

    int descriptor() const override { return watched; }
    std::uint32_t events() const override { return awaited; }
    bool serve() noexcept override;

    // Whether the library takes the settings.
    static bool canServe(const Service& service) noexcept;

  private:
    struct Callbacks;

    static MHD_Daemon* startDaemon(const Service& service, Client* client, bool inSet) noexcept;
    bool begin() noexcept;
    bool watchesSocket() const noexcept { return watched == socket; }
    void run(std::uint32_t ready) noexcept;
    void updateAwaited() noexcept;

    const Service& service;
    const sockaddr_storage address;
    const socklen_t addressLength;
    const std::string localAddress;  // canonical, of this machine's end; empty when it is unknown
    Connection* place;
    MHD_Daemon* daemon = nullptr;  // null until the client sends something
    const int socket;              // the instance owns it as soon as there is one
    int watched;                   // the socket or a descriptor of the instance
    std::uint32_t awaited;         // events of epoll
    bool isOpen = false;           // for the library
};

}  // namespace host
