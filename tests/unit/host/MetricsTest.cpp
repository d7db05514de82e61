#include "host/Metrics.h"

#include <gmock/gmock.h>

#include <thread>
#include <vector>

namespace {

using host::Handler;
using host::Metrics;
using host::MetricsPage;
using host::Outcome;
using testing::HasSubstr;
using testing::Not;

std::optional<std::uint64_t> noDriver() {
    return std::nullopt;
}

TEST(Metrics, CountsRequestsByHandlerAndOutcome) {
    Metrics metrics(noDriver);
    metrics.countEndedRequest(Handler::Service, Outcome::Ok);
    metrics.countEndedRequest(Handler::Service, Outcome::Ok);
    metrics.countEndedRequest(Handler::Service, Outcome::RpcError);
    metrics.countEndedRequest(Handler::Host, Outcome::HttpError);
    const std::string text = metrics.text();
    EXPECT_THAT(text, HasSubstr("# TYPE qitrmc_requests_total counter\n"));
    const auto expectCount = [&](const char* handler, const char* outcome, const char* count) {
        EXPECT_THAT(text, HasSubstr(std::string("qitrmc_requests_total{handler=\"") + handler +
                                    "\",outcome=\"" + outcome + "\"} " + count + "\n"));
    };
    expectCount("service", "ok", "2");
    expectCount("service", "rpc_error", "1");
    expectCount("service", "http_error", "0");
    expectCount("service", "aborted", "0");
    expectCount("host", "ok", "0");
    expectCount("host", "http_error", "1");
    expectCount("host", "aborted", "0");
    EXPECT_THAT(text, Not(HasSubstr("handler=\"host\",outcome=\"rpc_error\"")));
}

TEST(Metrics, CountsTimesInCumulatedBucketsThatContainTheirBounds) {
    Metrics metrics(noDriver);
    metrics.countTime(std::chrono::microseconds(30));
    metrics.countTime(std::chrono::milliseconds(1));
    metrics.countTime(std::chrono::seconds(500));
    const std::string text = metrics.text();
    const auto expectBucket = [&](const char* bound, const char* count) {
        EXPECT_THAT(text, HasSubstr(std::string("qitrmc_request_duration_seconds_bucket{le=\"") +
                                    bound + "\"} " + count + "\n"));
    };
    expectBucket("0.0001", "1");
    expectBucket("0.0005", "1");
    expectBucket("0.001", "2");
    expectBucket("120", "2");
    expectBucket("+Inf", "3");
    EXPECT_THAT(text, HasSubstr("qitrmc_request_duration_seconds_count 3\n"));
    EXPECT_THAT(text, HasSubstr("qitrmc_request_duration_seconds_sum 500.00103"));
}

TEST(Metrics, ShowsWhatIsThereNowAndWhatWasThereInAll) {
    Metrics metrics(noDriver);
    metrics.countOpenedConnection();
    metrics.countOpenedConnection();
    metrics.countClosedConnection();
    metrics.countBegunRequest();
    metrics.countBegunRequest();
    metrics.countEndedRequest(Handler::Service, Outcome::Ok);
    metrics.countReceivedBytes(2500000000);  // a body of 32 bits, twice
    metrics.countReceivedBytes(2500000000);
    metrics.countSentBytes(20);
    const std::string text = metrics.text();
    EXPECT_THAT(text, HasSubstr("\nqitrmc_connections 1\n"));
    EXPECT_THAT(text, HasSubstr("\nqitrmc_connections_total 2\n"));
    EXPECT_THAT(text, HasSubstr("\nqitrmc_requests_in_flight 1\n"));
    EXPECT_THAT(text, HasSubstr("\nqitrmc_request_bytes_total 5000000000\n"));
    EXPECT_THAT(text, HasSubstr("\nqitrmc_response_bytes_total 20\n"));
}

TEST(Metrics, AddsUpWhatManyThreadsCount) {
    Metrics metrics(noDriver);
    metrics.countOpenedConnection();
    metrics.countBegunRequest();
    for (int i = 0; i < 20; ++i) {
        std::thread([&metrics] {
            metrics.countOpenedConnection();
            metrics.countClosedConnection();
            metrics.countBegunRequest();
            metrics.countReceivedBytes(3);
            metrics.countSentBytes(5);
            metrics.countTime(std::chrono::seconds(1));
            metrics.countEndedRequest(Handler::Host, Outcome::HttpError);
        }).join();
    }
    std::thread([&metrics] { metrics.countClosedConnection(); }).join();
    const std::string text = metrics.text();
    for (const char* line :
         {"qitrmc_connections 0", "qitrmc_connections_total 21", "qitrmc_requests_in_flight 1",
          "qitrmc_request_bytes_total 60", "qitrmc_response_bytes_total 100",
          "qitrmc_requests_total{handler=\"host\",outcome=\"http_error\"} 20",
          "qitrmc_request_duration_seconds_bucket{le=\"1\"} 20",
          "qitrmc_request_duration_seconds_sum 20"}) {
        EXPECT_THAT(text, HasSubstr(std::string("\n") + line + "\n"));
    }
}

// So it can be while the counts of the threads are added up one after another.
TEST(Metrics, ShowNothingLessThanZero) {
    Metrics metrics(noDriver);
    metrics.countClosedConnection();
    metrics.countEndedRequest(Handler::Service, Outcome::Ok);
    EXPECT_THAT(metrics.text(), HasSubstr("\nqitrmc_connections 0\n"));
    EXPECT_THAT(metrics.text(), HasSubstr("\nqitrmc_requests_in_flight 0\n"));
}

TEST(Metrics, HasCallsOfTheDriverOnlyWhenTheyAreKnown) {
    EXPECT_THAT(Metrics(noDriver).text(), Not(HasSubstr("driver")));
    const Metrics metrics([] { return std::optional<std::uint64_t>(7); });
    EXPECT_THAT(metrics.text(), HasSubstr("\nqitrmc_driver_calls_total 7\n"));
}

TEST(Metrics, LosesNothingWhenThreadsCountAtOnce) {
    Metrics metrics(noDriver);
    std::vector<std::thread> threads;
    for (int i = 0; i < 4; ++i) {
        threads.emplace_back([&metrics] {
            for (int n = 0; n < 10000; ++n) {
                metrics.countTime(std::chrono::microseconds(1));
            }
        });
    }
    metrics.text();
    for (std::thread& thread : threads) {
        thread.join();
    }
    EXPECT_THAT(metrics.text(), HasSubstr("qitrmc_request_duration_seconds_count 40000\n"));
}

TEST(MetricsPage, CanOnlyBeRead) {
    const Metrics metrics(noDriver);
    const MetricsPage page(metrics);
    EXPECT_TRUE(page.has("/metrics"));
    EXPECT_FALSE(page.has("/metrics/"));
    EXPECT_EQ(page.answer({"GET", "/metrics", ""}).code, 200);
    EXPECT_EQ(page.answer({"HEAD", "/metrics", ""}).code, 200);
    EXPECT_EQ(page.answer({"POST", "/metrics", ""}).code, 405);
}

}  // namespace
