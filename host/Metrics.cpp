#include "host/Metrics.h"

#include <prometheus/metric_family.h>
#include <prometheus/text_serializer.h>

#include <algorithm>
#include <limits>
#include <utility>
#include <vector>

namespace host {

namespace {

using prometheus::ClientMetric;
using prometheus::MetricFamily;
using prometheus::MetricType;

constexpr const char* handlers[] = {"service", "host"};
constexpr const char* outcomes[] = {"ok", "rpc_error", "http_error", "aborted"};

ClientMetric counterOf(std::uint64_t value) {
    ClientMetric metric;
    metric.counter.value = static_cast<double>(value);
    return metric;
}

// The value is less than zero when an end was added up, but not yet the beginning, which another
// thread has counted.
ClientMetric gaugeOf(std::uint64_t value) {
    ClientMetric metric;
    metric.gauge.value =
        static_cast<double>(std::max<std::int64_t>(static_cast<std::int64_t>(value), 0));
    return metric;
}

MetricFamily family(const char* name, const char* help, MetricType type,
                    std::vector<ClientMetric> metrics) {
    MetricFamily family;
    family.name = name;
    family.help = help;
    family.type = type;
    family.metric = std::move(metrics);
    return family;
}

MetricFamily counter(const char* name, const char* help, std::uint64_t value) {
    return family(name, help, MetricType::Counter, {counterOf(value)});
}

MetricFamily gauge(const char* name, const char* help, std::uint64_t value) {
    return family(name, help, MetricType::Gauge, {gaugeOf(value)});
}

// Only the plug-in answers with JSON-RPC errors.
bool canHappen(std::size_t handler, std::size_t outcome) {
    return handler == static_cast<std::size_t>(Handler::Service) ||
           outcome != static_cast<std::size_t>(Outcome::RpcError);
}

template <typename Counts>
MetricFamily requestsFamily(const Counts& ended) {
    std::vector<ClientMetric> metrics;
    for (std::size_t handler = 0; handler < ended.size(); ++handler) {
        for (std::size_t outcome = 0; outcome < ended[handler].size(); ++outcome) {
            if (!canHappen(handler, outcome)) {
                continue;
            }
            metrics.push_back(counterOf(ended[handler][outcome]));
            metrics.back().label = {{"handler", handlers[handler]}, {"outcome", outcomes[outcome]}};
        }
    }
    return family("qitrmc_requests_total", "Requests that have ended", MetricType::Counter,
                  std::move(metrics));
}

template <typename Bounds, typename Counts>
MetricFamily timesFamily(const Bounds& bounds, const Counts& buckets, std::uint64_t nanoseconds) {
    ClientMetric metric;
    std::uint64_t sum = 0;
    for (std::size_t i = 0; i < buckets.size(); ++i) {
        sum += buckets[i];
        const double bound =
            i < bounds.size() ? bounds[i] : std::numeric_limits<double>::infinity();
        metric.histogram.bucket.push_back({sum, bound});
    }
    metric.histogram.sample_count = sum;
    metric.histogram.sample_sum = static_cast<double>(nanoseconds) * 1e-9;
    return family("qitrmc_request_duration_seconds",
                  "How long the service took for a request, without its transport",
                  MetricType::Histogram, {std::move(metric)});
}

}  // namespace

void Metrics::countTime(Seconds time) noexcept {
    const auto bound = std::lower_bound(bounds.begin(), bounds.end(), time.count());
    Counts& some = own();
    add(some.buckets[static_cast<std::size_t>(bound - bounds.begin())], 1);
    add(some.nanoseconds, std::chrono::duration_cast<std::chrono::nanoseconds>(time).count());
}

void Metrics::addUp(Counts& total, const Counts& some) noexcept {
    add(total.openConnections, some.openConnections.load());
    add(total.allConnections, some.allConnections.load());
    add(total.inFlight, some.inFlight.load());
    add(total.receivedBytes, some.receivedBytes.load());
    add(total.sentBytes, some.sentBytes.load());
    for (std::size_t handler = 0; handler < some.ended.size(); ++handler) {
        for (std::size_t outcome = 0; outcome < some.ended[handler].size(); ++outcome) {
            add(total.ended[handler][outcome], some.ended[handler][outcome].load());
        }
    }
    for (std::size_t i = 0; i < some.buckets.size(); ++i) {
        add(total.buckets[i], some.buckets[i].load());
    }
    add(total.nanoseconds, some.nanoseconds.load());
}

std::string Metrics::text() const {
    Counts total;
    counts.forEach([&](const Counts& some) { addUp(total, some); });
    std::vector<MetricFamily> families = {
        requestsFamily(total.ended),
        timesFamily(bounds, total.buckets, total.nanoseconds),
        gauge("qitrmc_requests_in_flight", "Requests that have begun and not ended",
              total.inFlight),
        gauge("qitrmc_connections", "Open connections", total.openConnections),
        counter("qitrmc_connections_total", "Connections so far", total.allConnections),
        counter("qitrmc_request_bytes_total", "Bytes of request bodies received",
                total.receivedBytes),
        counter("qitrmc_response_bytes_total", "Bytes of response bodies sent", total.sentBytes),
    };
    if (const std::optional<std::uint64_t> calls = driverCalls()) {
        families.push_back(
            counter("qitrmc_driver_calls_total", "Calls of the simulated driver", *calls));
    }
    return prometheus::TextSerializer().Serialize(families);
}

SiteResponse MetricsPage::answer(const SiteRequest& request) const {
    if (request.method != "GET" && request.method != "HEAD") {
        return refuseMethod();
    }
    SiteResponse response;
    response.type = "text/plain; version=0.0.4; charset=utf-8";
    response.body = metrics.text();
    response.headers = {{"Cache-Control", "no-store"}};
    return response;
}

}  // namespace host
