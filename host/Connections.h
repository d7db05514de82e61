#pragma once

#include <atomic>
#include <condition_variable>
#include <cstdint>
#include <list>
#include <mutex>

namespace host {

// One connection of a client, as far as its use of time goes. Each is in a cache line of its own,
// as the threads that serve the connections write to them.
class alignas(64) Connection {
  public:
    explicit Connection(int socket) noexcept;

    // The client's next step begins: to send a request's head, its body, to fetch the response.
    void waitForClient() noexcept;

    // The plug-in works on the request; the client is owed an answer however long that takes.
    void workForClient() noexcept;

  private:
    friend class Connections;
    const int socket;
    std::atomic<std::uint32_t>
        waitingSince;  // in seconds of the steady clock; 0 while the host works
    std::list<Connection>::iterator self;
};

// The open connections. One whose client keeps the host waiting costs a place; this is where it
// loses it. All functions may be called from any thread.
class Connections {
  public:
    // most: how many connections the host takes at once. patience: how many seconds it waits for a
    // client's step.
    Connections(std::uint32_t most, std::uint32_t patience) noexcept;

    // Waits until fewer connections are open than the host takes. False once close() was called.
    bool waitForPlace() noexcept;

    // Waits until a connection is removed, a second at most.
    void waitForRemoval() noexcept;

    // Waits until there is no connection.
    void waitUntilEmpty() noexcept;

    // Ends every wait for a place.
    void close() noexcept;

    // Remembers a connection until remove(). Null when memory runs out; the socket is then shut.
    Connection* add(int socket) noexcept;

    // To be called before the socket is closed.
    void remove(Connection* connection) noexcept;

    // Shuts each connection whose client has taken too long: longer than the patience or, when all
    // places are taken, longer than two seconds. To be called about once a second.
    void shutOverdue() noexcept;

    // Shuts each connection.
    void shutAll() noexcept;

  private:
    const std::uint32_t most;
    const std::uint32_t patience;
    std::mutex mutex;
    std::condition_variable changed;
    bool closed = false;
    std::list<Connection> open;
};

}  // namespace host
