// Measures the production of the text of a failure: with the translator of the service, and for
// comparison with LuaRuntime::Plain, which compiles every script for each failure. Both are called
// through describeStatus. "peakBytes" is the maximum memory in use during one call, "keptBytes" the
// memory that the process keeps afterwards.

#include <benchmark/benchmark.h>
#include <malloc.h>

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <string>

#include "qierr/Writer.h"
#include "qihtl/Allocator.h"
#include "qitrmcwebsvc/describeStatus.h"
#include "qixlator/Registration.h"
#include "qixlatorlua/BytecodeCache.h"
#include "qixlatorlua/LuaXlator.h"

namespace {

constexpr const char* fastName = "mxlator_qitrmc";
constexpr const char* plainName = "plain_mxlator";

// ---- Memory -------------------------------------------------------------------------------------

std::int64_t liveBytes = 0;
std::int64_t peakBytes = 0;

void account(std::int64_t change) {
    liveBytes += change;
    peakBytes = std::max(peakBytes, liveBytes);
}

}  // namespace

// Replaces the allocation function of the translation layers. Counts without a lock, for the single
// thread of the benchmarks, since the cost of counting is added to each of the many allocations.
void* qihtl_realloc(void* block, std::size_t size) {
    const auto oldSize = static_cast<std::int64_t>(::malloc_usable_size(block));
    if (size == 0) {
        account(-oldSize);
        std::free(block);
        return nullptr;
    }
    void* const moved = std::realloc(block, size);
    if (moved != nullptr) {
        account(static_cast<std::int64_t>(::malloc_usable_size(moved)) - oldSize);
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
    const std::int64_t before = liveBytes;
    peakBytes = before;
    for (auto _ : state) {
        benchmark::DoNotOptimize(describe(translator));
    }
    state.counters["peakBytes"] = static_cast<double>(peakBytes - before);
    state.counters["keptBytes"] =
        static_cast<double>(qixlatorlua::BytecodeCache::ofEmbeddedFiles()->size());
}

BENCHMARK_CAPTURE(failure, translated, fastName);
BENCHMARK_CAPTURE(failure, compiledEachTime, plainName);

}  // namespace
