#include "host/ListenSocket.h"

#include <netdb.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <memory>

#include "host/Failure.h"

namespace host {

namespace {

using AddressList = std::unique_ptr<addrinfo, decltype(&freeaddrinfo)>;

std::string urlAuthority(const std::string& address, const std::string& port) {
    const bool ipv6 = address.find(':') != std::string::npos;
    return (ipv6 ? "[" + address + "]" : address) + ":" + port;
}

AddressList resolve(const std::string& address, const std::string& port, const std::string& where) {
    addrinfo hints = {};
    hints.ai_socktype = SOCK_STREAM;
    hints.ai_flags = AI_PASSIVE | AI_NUMERICSERV;
    addrinfo* found = nullptr;
    const int error = getaddrinfo(address.c_str(), port.c_str(), &hints, &found);
    if (error != 0) {
        throw Failure("Cannot listen on " + where + ": " + gai_strerror(error) +
                      ". Name an address of this machine with --listen.");
    }
    return AddressList(found, freeaddrinfo);
}

[[noreturn]] void failToListen(const std::string& where, int error) {
    if (error == EADDRINUSE) {
        throw Failure("Cannot listen on " + where +
                      ": the port is in use. Stop the program that uses it, or choose another port "
                      "with --listen.");
    }
    throw Failure("Cannot listen on " + where + ": " + std::strerror(error) +
                  ". Choose another address or port with --listen.");
}

}  // namespace

ListenSocket::ListenSocket(const std::string& address, const std::string& port)
    : where(urlAuthority(address, port)) {
    const AddressList found = resolve(address, port, where);
    socket = ::socket(found->ai_family, SOCK_STREAM | SOCK_CLOEXEC, 0);
    if (socket < 0) {
        failToListen(where, errno);
    }
    // A host that is started again need not wait for connections of the last one to fade.
    const int on = 1;
    setsockopt(socket, SOL_SOCKET, SO_REUSEADDR, &on, sizeof on);
    if (bind(socket, found->ai_addr, found->ai_addrlen) != 0) {
        const int error = errno;
        close(socket);
        failToListen(where, error);
    }
}

ListenSocket::~ListenSocket() {
    close(socket);
}

void ListenSocket::listen() {
    if (::listen(socket, SOMAXCONN) != 0) {
        failToListen(where, errno);
    }
}

int ListenSocket::accept(sockaddr_storage& address, socklen_t& length) noexcept {
    length = sizeof address;
    return accept4(socket, reinterpret_cast<sockaddr*>(&address), &length,
                   SOCK_NONBLOCK | SOCK_CLOEXEC);
}

void ListenSocket::stopListening() noexcept {
    shutdown(socket, SHUT_RDWR);
}

std::string ListenSocket::authority() const {
    sockaddr_storage address = {};
    socklen_t length = sizeof address;
    char host[NI_MAXHOST] = "";
    char port[NI_MAXSERV] = "";
    getsockname(socket, reinterpret_cast<sockaddr*>(&address), &length);
    getnameinfo(reinterpret_cast<const sockaddr*>(&address), length, host, sizeof host, port,
                sizeof port, NI_NUMERICHOST | NI_NUMERICSERV);
    return urlAuthority(host, port);
}

}  // namespace host
