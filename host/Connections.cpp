#include "host/Connections.h"

#include <sys/socket.h>

#include <algorithm>
#include <chrono>
#include <new>

namespace host {

namespace {

constexpr std::chrono::seconds longestWayIn(1);
constexpr std::uint32_t patienceWhenFull = 2;
constexpr std::uint32_t notWaiting = 0;

std::uint32_t secondsNow() noexcept {
    using namespace std::chrono;
    const auto now = duration_cast<seconds>(steady_clock::now().time_since_epoch());
    return static_cast<std::uint32_t>(now.count()) + 1;  // never notWaiting
}

}  // namespace

Connection::Connection(int socket) noexcept : socket(socket), waitingSince(secondsNow()) {}

void Connection::waitForClient() noexcept {
    waitingSince.store(secondsNow(), std::memory_order_relaxed);
}

void Connection::workForClient() noexcept {
    waitingSince.store(notWaiting, std::memory_order_relaxed);
}

Connections::Connections(std::uint32_t most, std::uint32_t patience) noexcept
    : most(most), patience(patience) {}

bool Connections::waitForPlace() noexcept {
    std::unique_lock<std::mutex> lock(mutex);
    changed.wait_for(lock, longestWayIn, [this] { return closed || !placeKept; });
    changed.wait(lock, [this] { return closed || open.size() < most; });
    placeKept = true;
    return !closed;
}

void Connections::close() noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    closed = true;
    changed.notify_all();
}

Connection* Connections::add(int socket) noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    placeKept = false;
    changed.notify_one();
    try {
        Connection& connection = open.emplace_front(socket);
        connection.self = open.begin();
        return &connection;
    } catch (const std::bad_alloc&) {
        shutdown(socket, SHUT_RDWR);
        return nullptr;
    }
}

void Connections::remove(Connection* connection) noexcept {
    if (connection == nullptr) {
        return;
    }
    const std::lock_guard<std::mutex> lock(mutex);
    open.erase(connection->self);
    changed.notify_one();
}

void Connections::shutOverdue() noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    const bool full = open.size() >= most;
    const std::uint32_t limit = full ? std::min(patience, patienceWhenFull) : patience;
    const std::uint32_t now = secondsNow();
    for (const Connection& connection : open) {
        const std::uint32_t since = connection.waitingSince.load(std::memory_order_relaxed);
        if (since != notWaiting && since < now && now - since > limit) {
            shutdown(connection.socket, SHUT_RDWR);
        }
    }
}

}  // namespace host
