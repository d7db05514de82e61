// Measures requests that are spread over many open sessions. The time of a request should not
// depend on the number of sessions, which is the argument.

#include <benchmark/benchmark.h>

#include <string>
#include <vector>

#include "Service.h"

namespace {

// Many open sessions, which are used in an order that defeats caches.
class Sessions {
  public:
    Sessions(std::size_t count, const char* devices) {
        for (std::size_t i = 0; i < count; ++i) {
            ids.push_back(service.openSession(devices));
        }
    }

    std::string answerNext() {
        next = (next + 7919) % ids.size();
        return service.answer(Service::request(
            "getProperty", R"("session_id":")" + ids[next] +
                               R"(","devices":["Mod1"],"property":"Dev.Temperature")"));
    }

    Service service;

  private:
    std::vector<std::string> ids;
    std::size_t next = 0;
};

void sessionsGetProperty(benchmark::State& state, const char* devices) {
    Sessions sessions(static_cast<std::size_t>(state.range(0)), devices);
    if (!isSuccess(sessions.answerNext())) {
        state.SkipWithError("no success");
    }
    for (auto _ : state) {
        benchmark::DoNotOptimize(sessions.answerNext());
    }
}

void sessionsOpenAndClose(benchmark::State& state, const char* devices) {
    Sessions sessions(static_cast<std::size_t>(state.range(0)), devices);
    for (auto _ : state) {
        const std::string id = sessions.service.openSession();
        sessions.service.answer(Service::request("closeSession", R"("session_id":")" + id + '"'));
    }
}

// The service holds at most 100 sessions with resources.
BENCHMARK_CAPTURE(sessionsGetProperty, sessionsWithResources, "Mod1")
    ->RangeMultiplier(10)
    ->Range(1, 100);
BENCHMARK_CAPTURE(sessionsGetProperty, sessionsWithout, "")->RangeMultiplier(10)->Range(1, 100000);
BENCHMARK_CAPTURE(sessionsOpenAndClose, sessionsWithResources, "Mod1")
    ->RangeMultiplier(10)
    ->Range(1, 100);
BENCHMARK_CAPTURE(sessionsOpenAndClose, sessionsWithout, "")->RangeMultiplier(10)->Range(1, 100000);

}  // namespace
