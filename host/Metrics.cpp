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

ClientMetric gaugeOf(std::uint64_t value) {
    ClientMetric metric;
    metric.gauge.value = static_cast<double>(value);
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
    add(buckets[static_cast<std::size_t>(bound - bounds.begin())], 1);
    add(nanoseconds, std::chrono::duration_cast<std::chrono::nanoseconds>(time).count());
}

std::string Metrics::text() const {
    std::vector<MetricFamily> families = {
        requestsFamily(ended),
        timesFamily(bounds, buckets, nanoseconds),
        gauge("qitrmc_requests_in_flight", "Requests that have begun and not ended", inFlight),
        gauge("qitrmc_connections", "Open connections", openConnections),
        counter("qitrmc_connections_total", "Connections so far", allConnections),
        counter("qitrmc_request_bytes_total", "Bytes of request bodies received", receivedBytes),
        counter("qitrmc_response_bytes_total", "Bytes of response bodies sent", sentBytes),
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
