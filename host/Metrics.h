#pragma once

#include <array>
#include <atomic>
#include <chrono>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <optional>
#include <string>

#include "common/ThreadShares.h"
#include "host/Site.h"

namespace host {

// How a request ended.
enum class Outcome {
    Ok,
    RpcError,   // a JSON-RPC error, of any request in case of a batch
    HttpError,  // an HTTP status of 400 or above
    Aborted,    // the client went before the response was ready
};

// Who answered a request: the plug-in, or the host itself with the page, a refusal and so on.
enum class Handler { Service, Host };

// Counts what the host does. All functions may be called from any thread; those that count take a
// few atomic additions, each thread in memory that few others use.
class Metrics {
  public:
    using Seconds = std::chrono::duration<double>;

    // The number of calls of the driver so far; nothing when it is unknown.
    using DriverCalls = std::function<std::optional<std::uint64_t>()>;

    explicit Metrics(DriverCalls driverCalls) : driverCalls(std::move(driverCalls)) {}

    void countOpenedConnection() noexcept {
        add(own().openConnections, 1);
        add(own().allConnections, 1);
    }
    void countClosedConnection() noexcept { add(own().openConnections, -1); }

    void countBegunRequest() noexcept { add(own().inFlight, 1); }
    void countEndedRequest(Handler handler, Outcome outcome) noexcept {
        add(own().inFlight, -1);
        add(own().ended[static_cast<std::size_t>(handler)][static_cast<std::size_t>(outcome)], 1);
    }

    // Of a request to the service: how long the plug-in took.
    void countTime(Seconds time) noexcept;

    void countReceivedBytes(std::size_t size) noexcept { add(own().receivedBytes, size); }
    void countSentBytes(std::size_t size) noexcept { add(own().sentBytes, size); }

    // All counts in the text format of Prometheus.
    std::string text() const;

  private:
    using Count = std::atomic<std::uint64_t>;

    // The upper bounds of the buckets of the histogram, in seconds.
    static constexpr std::array<double, 16> bounds = {50e-6, 100e-6, 250e-6, 500e-6, 1e-3,   2.5e-3,
                                                      5e-3,  10e-3,  25e-3,  50e-3,  100e-3, 250e-3,
                                                      1.0,   5.0,    30.0,   120.0};

    template <typename Number>
    static void add(Count& count, Number number) noexcept {
        count.fetch_add(static_cast<std::uint64_t>(number), std::memory_order_relaxed);
    }

    // What some of the threads have counted. What one of them adds another one may subtract, so
    // only the sums over all threads mean something.
    struct Counts {
        Count openConnections{0};
        Count allConnections{0};
        Count inFlight{0};
        Count receivedBytes{0};
        Count sentBytes{0};
        std::array<std::array<Count, 4>, 2> ended{};     // by Handler and Outcome
        std::array<Count, bounds.size() + 1> buckets{};  // each without those below it
        Count nanoseconds{0};
    };

    // The counts that the calling thread adds to.
    Counts& own() noexcept { return counts.own(); }

    static void addUp(Counts& total, const Counts& some) noexcept;

    common::ThreadShares<Counts> counts;
    const DriverCalls driverCalls;
};

// The counts, for a collector: at /metrics.
class MetricsPage : public SitePart {
  public:
    // The metrics must outlive this.
    explicit MetricsPage(const Metrics& metrics) : metrics(metrics) {}

    bool has(const std::string& path) const override { return path == "/metrics"; }
    SiteResponse answer(const SiteRequest& request) const override;

  private:
    const Metrics& metrics;
};

}  // namespace host
