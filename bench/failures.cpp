// Measures failures. "request" is a whole request with one unknown name. "translated" is the
// production of the text of a failure alone, and "compiledEachTime" the same with
// LuaRuntime::Plain, which compiles every script for each failure; both are called through
// describeStatus. "peakBytes" is the maximum memory in use during one call beyond what is kept,
// "keptBytes" the memory that the process keeps afterwards, "systemNs" the system time of a call.

#include <benchmark/benchmark.h>
#include <malloc.h>
#include <sys/resource.h>

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <string>

#include "Service.h"
#include "qierr/Writer.h"
#include "qihtl/Allocator.h"
#include "qitrmcwebsvc/describeStatus.h"
#include "qixlator/KeptSearches.h"
#include "qixlator/Registration.h"
#include "qixlatorlua/BytecodeCache.h"
#include "qixlatorlua/LuaXlator.h"
#include "qixlatorlua/PreparedStates.h"

namespace {

constexpr const char* fastName = "mxlator_qitrmc";
constexpr const char* plainName = "plain_mxlator";

// ---- Memory -------------------------------------------------------------------------------------

bool isCounting = false;
std::int64_t liveBytes = 0;
std::int64_t peakBytes = 0;

std::int64_t sizeOf(void* block) {
    return static_cast<std::int64_t>(::malloc_usable_size(block));
}

void account(std::int64_t change) {
    liveBytes += change;
    peakBytes = std::max(peakBytes, liveBytes);
}

}  // namespace

// Replaces the allocation function of the translation layers. Counts without a lock, for the single
// thread of the benchmarks, and only outside the measurement of time, to which counting would add
// some cost with each of the many allocations.
void* qihtl_realloc(void* block, std::size_t size) {
    const std::int64_t oldSize = isCounting ? sizeOf(block) : 0;
    void* moved = nullptr;
    if (size == 0) {
        std::free(block);
    } else {
        moved = std::realloc(block, size);
    }
    if (isCounting && (moved != nullptr || size == 0)) {
        account(sizeOf(moved) - oldSize);
    }
    return moved;
}

namespace {

// ---- The plain translator -----------------------------------------------------------------------

XlatorInterface* createPlain(const char*, const char*, qierr_Status* status) {
    return qixlatorlua::createLuaXlator(
        fastName, qixlator::localRegistrations().find(fastName)->registrationInfo,
        qixlatorlua::LuaRuntime::Plain, status);
}

const qixlator::XlatorRegistration plainRegistration(qixlator::localRegistrations(), plainName,
                                                     "{}", createPlain);

// ---- Benchmarks ---------------------------------------------------------------------------------

// A frequent failure, with its one detail.
void fillStatus(qierr_Status* status, const char* translator) {
    qierr_Status_setCodeAt(status, -250833, QITRMC_HERE);
    addUsageString(qierr_orderedData(translator, status), "kUsageTypeSessionId", "_session7");
}

double systemNanoseconds() {
    rusage usage{};
    ::getrusage(RUSAGE_THREAD, &usage);
    return usage.ru_stime.tv_sec * 1e9 + usage.ru_stime.tv_usec * 1e3;
}

template <typename Action>
void measure(benchmark::State& state, Action action) {
    isCounting = true;
    const std::int64_t before = liveBytes;
    peakBytes = before;
    action();
    isCounting = false;
    const double systemBefore = systemNanoseconds();
    for (auto _ : state) {
        action();
    }
    state.counters["systemNs"] =
        benchmark::Counter(systemNanoseconds() - systemBefore, benchmark::Counter::kAvgIterations);
    state.counters["peakBytes"] = static_cast<double>(peakBytes - before);
    state.counters["keptBytes"] =
        static_cast<double>(qixlatorlua::BytecodeCache::ofEmbeddedFiles()->size() +
                            qixlatorlua::PreparedStates::ofProcess().size() +
                            qixlator::KeptSearches::ofProcess().size());
}

std::string describe(const char* translator) {
    qierr::Status status;
    fillStatus(&status, translator);
    return nQITRMCWEBSVC100::describeStatus(status);
}

void failure(benchmark::State& state, const char* translator) {
    if (describe(translator).find("_session7") == std::string::npos ||
        describe(fastName) != describe(plainName)) {
        state.SkipWithError("the words are not those expected");
    }
    measure(state, [&] { benchmark::DoNotOptimize(describe(translator)); });
}

void request(benchmark::State& state) {
    Service service;
    const std::string text = Service::request(
        "getProperty", R"("session_id":")" + service.openSession("Mod1") +
                           R"(","devices":["Mod99"],"property":"Dev.Temperature")");
    if (service.answer(text).find("Mod99") == std::string::npos) {
        state.SkipWithError(service.answer(text).c_str());
    }
    measure(state, [&] { benchmark::DoNotOptimize(service.answer(text)); });
}

BENCHMARK(request)->Name("failure/request");
BENCHMARK_CAPTURE(failure, translated, fastName);
BENCHMARK_CAPTURE(failure, compiledEachTime, plainName);

}  // namespace
