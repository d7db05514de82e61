// What it costs to put one status into words, by either way of running the scripts.

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <string>
#include <vector>

#include "qierr/Writer.h"
#include "qixlator/Registration.h"
#include "qixlator/json1.h"
#include "qixlator/qixlator.h"
#include "qixlatorlua/BytecodeCache.h"
#include "qixlatorlua/LuaXlator.h"
#include "support/FaultyAllocator.h"

namespace {

using Clock = std::chrono::steady_clock;
using qixlatorlua::LuaRuntime;

constexpr int rounds = 500;

LuaRuntime runtime;

// Sessions find the translator in both ways under names of their own.
XlatorInterface* create(const char*, const char* registrationInfo, qierr_Status* status) {
    return qixlatorlua::createLuaXlator("mxlator_qitrmc", registrationInfo, runtime, status);
}

void translate(const qierr_Status& source) {
    qierr::Status failure;
    qihtl::String text;
    qixlator::Session* session = qixlator_createSession(&failure);
    qixlator::json1::translateErrStatusToRawText(session, &source, 0x200, 11, &text, &failure);
    qixlator_destroySession(session);
    if (failure.code < 0) {
        std::printf("failed with %d: %s\n", failure.code, failure.json);
    }
}

void measure(const char* name, LuaRuntime way, const qierr_Status& source) {
    runtime = way;
    translate(source);
    std::vector<double> times;
    for (int round = 0; round < rounds; ++round) {
        const Clock::time_point start = Clock::now();
        translate(source);
        times.push_back(std::chrono::duration<double, std::milli>(Clock::now() - start).count());
    }
    std::sort(times.begin(), times.end());
    FaultyAllocator::succeed();
    const std::int64_t before = FaultyAllocator::liveBytes();
    translate(source);
    std::printf(
        "%-6s median %.3f ms, 99th percentile %.3f ms, %lld KiB at its peak, %llu requests\n", name,
        times[rounds / 2], times[rounds * 99 / 100],
        static_cast<long long>((FaultyAllocator::peakBytes() - before) / 1024),
        static_cast<unsigned long long>(FaultyAllocator::requests()));
}

}  // namespace

int main() {
    const char* info = qixlator::localRegistrations().find("mxlator_qitrmc")->registrationInfo;
    const qixlator::XlatorRegistration registration(qixlator::localRegistrations(), "bench", info,
                                                    create);
    qierr::Status source;
    qierr_Status_setCodeAt(&source, -250800, QITRMC_HERE);
    qierr_Writer writer = qierr_orderedData("bench", &source);
    writer = addUsageString(writer, "kUsageTypeParameter", "session_id");
    addUsageStringArray(writer, "kUsageTypeReservedBySessions", {"_session1", "_session2"});
    measure("plain", LuaRuntime::plain, source);
    measure("fast", LuaRuntime::fast, source);
    std::printf("bytecode kept in the process: %llu KiB\n",
                static_cast<unsigned long long>(
                    qixlatorlua::BytecodeCache::ofEmbeddedFiles()->size() / 1024));
    return 0;
}
