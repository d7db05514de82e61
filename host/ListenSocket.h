#pragma once

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

    int descriptor() const { return socket; }

    // The address and port as a URL has them, such as 127.0.0.1:8080 or [::1]:8080.
    std::string authority() const;

  private:
    const std::string where;  // as the user wrote it, for failures
    int socket = -1;
};

}  // namespace host
