#pragma once

#include <sys/socket.h>

#include <string>

namespace host {

// A TCP socket that clients connect to.
class ListenSocket {
  public:
    // Takes the address, but lets nobody connect yet. `port` is decimal, "0" for a free one.
    // Throws Failure.
    ListenSocket(const std::string& address, const std::string& port);
    ~ListenSocket();
    ListenSocket(const ListenSocket&) = delete;
    ListenSocket& operator=(const ListenSocket&) = delete;

    // Lets clients connect. Throws Failure.
    void listen();

    // Lets nobody connect any more, and ends an accept() that waits.
    void stopListening() noexcept;

    // Waits for a client. Gives its non-blocking socket, which the caller owns, and its address;
    // -1 when there is none, for want of file descriptors for example.
    int accept(sockaddr_storage& address, socklen_t& length) noexcept;

    // The address and port as a URL has them, such as 127.0.0.1:8080 or [::1]:8080.
    std::string authority() const;

  private:
    const std::string where;  // as the user wrote it, for failures
    int socket = -1;
};

}  // namespace host
