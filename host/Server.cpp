#include "host/Server.h"

#include <unistd.h>

#include <cerrno>
#include <memory>
#include <new>
#include <utility>

#include "host/Failure.h"

namespace host {

Server::Server(const Plugin& plugin, ListenSocket& socket, ServerSettings wanted,
               const OriginPolicy& policy, const Site& site)
    : socket(socket),
      settings(std::move(wanted)),
      connections(settings.connections, settings.timeout),
      service{plugin, settings, policy, site, connections, gate},
      workers(settings.threads) {
    if (!Client::canServe(service)) {
        throw Failure(
            settings.tls ? "HTTPS cannot be served with these files. Name a certificate in PEM "
                           "form with --tls-cert and the private key that belongs to it with "
                           "--tls-key."
                         : "The HTTP server cannot start. Free memory or threads of this machine.");
    }
    socket.listen();
    acceptor = std::thread([this] { acceptClients(); });
}

Server::~Server() {
    stopAccepting();
    connections.shutAll();
    connections.waitUntilEmpty();
}

void Server::acceptClients() noexcept {
    while (connections.waitForPlace()) {
        acceptClient();
    }
}

void Server::acceptClient() noexcept {
    sockaddr_storage address;
    socklen_t length;
    const int client = socket.accept(address, length);
    if (client < 0) {
        // Without descriptors or memory the client waits until another one goes.
        if (errno == EMFILE || errno == ENFILE || errno == ENOBUFS || errno == ENOMEM) {
            connections.waitForRemoval();
        }
        return;
    }
    std::unique_ptr<Client> served;
    try {
        served = std::make_unique<Client>(service, client, address, length);
    } catch (const std::bad_alloc&) {
        close(client);
        return;
    }
    if (workers.watch(served.get())) {
        served.release();
    }
}

void Server::shutOverdueConnections() noexcept {
    connections.shutOverdue();
}

void Server::stopAccepting() {
    gate.close();
    connections.close();
    socket.stopListening();
    if (acceptor.joinable()) {
        acceptor.join();
    }
}

bool Server::waitForRequests(std::chrono::milliseconds time) {
    return gate.waitUntilEmpty(time);
}

}  // namespace host
