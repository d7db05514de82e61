#include "host/Connections.h"

#include <sys/socket.h>
#include <time.h>

#include <algorithm>
#include <chrono>
#include <new>

namespace host {

namespace {

constexpr std::chrono::seconds longestWait(1);
constexpr std::uint32_t patienceWhenFull = 2;
constexpr std::uint32_t notWaiting = 0;

std::uint32_t secondsNow() noexcept {
    timespec now = {};
    clock_gettime(CLOCK_MONOTONIC_COARSE, &now);
    return static_cast<std::uint32_t>(now.tv_sec) + 1;  // never notWaiting
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
    changed.wait(lock, [this] { return closed || open.size() < most; });
    return !closed;
}

void Connections::waitForRemoval() noexcept {
    std::unique_lock<std::mutex> lock(mutex);
    if (!closed) {
        changed.wait_for(lock, longestWait);
    }
}

void Connections::waitUntilEmpty() noexcept {
    std::unique_lock<std::mutex> lock(mutex);
    changed.wait(lock, [this] { return open.empty(); });
}

void Connections::close() noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    closed = true;
    changed.notify_all();
}

Connection* Connections::add(int socket) noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
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
    changed.notify_all();
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

void Connections::shutAll() noexcept {
    const std::lock_guard<std::mutex> lock(mutex);
    for (const Connection& connection : open) {
        shutdown(connection.socket, SHUT_RDWR);
    }
}

}  // namespace host
