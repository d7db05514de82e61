// Measures requests that grow in one respect. The time for each part should not depend on the
// number of parts. The name of a benchmark says what is counted, its argument is the count.

#include <benchmark/benchmark.h>

#include <string>

#include "FreeDriver.h"
#include "Service.h"

namespace {

using Count = std::int64_t;

std::string repeated(const std::string& text, Count count, const char* separator = "") {
    std::string all;
    for (Count i = 0; i < count; ++i) {
        all += (i == 0 ? "" : separator) + text;
    }
    return all;
}

std::string array(const std::string& element, Count count) {
    return "[" + repeated(element, count, ",") + "]";
}

std::string text(const std::string& part, Count count) {
    return '"' + repeated(part, count) + '"';
}

// ---- Requests -----------------------------------------------------------------------------------
// Each function returns a request; `session` is its member with the id of an open session.

using MakeRequest = std::string (*)(const std::string& session, Count count);

std::string getTemperatures(const std::string& session, const std::string& resources) {
    return Service::request("getProperty",
                            session + R"(,"property":"Dev.Temperature",)" + resources);
}

std::string namesInDevices(const std::string& session, Count count) {
    return getTemperatures(session, R"("devices":)" + array("\"Mod9\"", count));
}

// The names of all devices from the last one of the driver's list to the first, in other letters,
// and again from the last one.
constexpr Count manyDevices = 4000;

std::string namesOfManyDevices(const std::string& session, Count count) {
    std::string names;
    for (Count i = 0; i < count; ++i) {
        names +=
            (i == 0 ? "\"MOD" : ",\"MOD") + std::to_string(manyDevices - i % manyDevices) + '"';
    }
    return getTemperatures(session, R"("devices":[)" + names + "]");
}

std::string namesInOneText(const std::string& session, Count count) {
    return getTemperatures(session, R"("devices":")" + repeated("mod18", count, ",") + '"');
}

std::string namesInRanges(const std::string& session, Count count) {
    return getTemperatures(session, R"("physical_channels":)" + array("\"Mod1/ch0:7\"", count / 8));
}

std::string batchElements(const std::string& session, Count count) {
    return array(getTemperatures(session, R"("devices":"Mod1")"), count);
}

std::string setTemperature(const std::string& session, const std::string& value) {
    return Service::request(
        "setProperty", session + R"(,"property":"Dev.Temperature","devices":["Mod1","Mod2"],)" +
                           R"("value":)" + value);
}

std::string valueNumbers(const std::string& session, Count count) {
    return setTemperature(session, array("36.625", count));
}

std::string nvmemBytesRead(const std::string& session, Count count) {
    return Service::request(
        "getNvmemBytes",
        session + R"(,"nvmem_area":"Mod1/user","address":0,"size":)" + std::to_string(count));
}

std::string nvmemBytesWritten(const std::string& session, Count count) {
    return Service::request(
        "setNvmemBytes",
        session + R"(,"nvmem_area":"Mod1/user","address":0,"data":)" + array("200", count));
}

// A request with little work and with further members.
std::string closing(const std::string& session, const std::string& members) {
    return R"({"jsonrpc":"2.0","id":1,"method":"abortSession","params":{)" + session + "}," +
           members + "}";
}

std::string unknownMembers(const std::string& session, Count count) {
    return closing(session, repeated(R"("unknown":1)", count, ","));
}

std::string nestedBrackets(const std::string& session, Count count) {
    return closing(session, R"("x":)" + repeated("[", count) + repeated("]", count));
}

std::string siblingBrackets(const std::string& session, Count count) {
    return closing(session, R"("x":)" + array(repeated("[", 16) + repeated("]", 16), count / 16));
}

std::string escapesInText(const std::string& session, Count count) {
    return closing(session, R"("x":)" + text(R"(\u00e9\n)", count / 2));
}

std::string charactersInId(const std::string& session, Count count) {
    return R"({"jsonrpc":"2.0","id":)" + text("\\\"", count) +
           R"(,"method":"abortSession","params":{)" + session + "}}";
}

std::string longExponents(const std::string& session, Count count) {
    return closing(session, R"("x":)" + array("0.1e-2147483647", count));
}

std::string digitsOfNumber(const std::string& session, Count count) {
    return closing(session, R"("x":0.)" + repeated("9", count));
}

// ---- Requests that fail -------------------------------------------------------------------------

std::string charactersOfUnknownName(const std::string& session, Count count) {
    return getTemperatures(session, R"("devices":)" + text("x", count));
}

std::string escapesOfUnknownName(const std::string& session, Count count) {
    return getTemperatures(session, R"("devices":)" + text(R"(\u00e9\n)", count / 2));
}

std::string bracketsTooDeep(const std::string& session, Count count) {
    return closing(session, R"("x":)" + repeated("[", count));
}

std::string batchElementsSkipped(const std::string& session, Count count) {
    return "[1," + repeated(getTemperatures(session, R"("devices":"Mod1")"), count, ",") + "]";
}

// ---- Registration -------------------------------------------------------------------------------

struct Case {
    const char* name;
    MakeRequest make;
    Count first;
    Count last;
    bool succeeds;
    std::uint32_t devices;
};

#define CASE_AMONG(devices, make, first, last, succeeds) \
    { #make, make, first, last, succeeds, devices }
#define CASE(...) CASE_AMONG(defaultDeviceCount, __VA_ARGS__)

const Case cases[] = {
    CASE(namesInDevices, 1024, 65536, true),
    CASE_AMONG(manyDevices, namesOfManyDevices, 1024, 65536, true),
    CASE(namesInOneText, 1024, 65536, true),
    CASE(namesInRanges, 1024, 65536, true),
    CASE(batchElements, 64, 4096, true),
    CASE(valueNumbers, 1024, 65536, true),
    CASE(nvmemBytesRead, 16384, 1048576, true),
    CASE(nvmemBytesWritten, 16384, 1048576, true),
    CASE(unknownMembers, 1024, 65536, true),
    CASE(nestedBrackets, 120, 960, true),
    CASE(siblingBrackets, 1024, 65536, true),
    CASE(escapesInText, 16384, 1048576, true),
    CASE(charactersInId, 16384, 1048576, true),
    CASE(longExponents, 1024, 65536, true),
    CASE(digitsOfNumber, 16384, 1048576, true),
    CASE(charactersOfUnknownName, 16384, 1048576, false),
    CASE(escapesOfUnknownName, 16384, 1048576, false),
    CASE(bracketsTooDeep, 16384, 1048576, false),
    CASE(batchElementsSkipped, 64, 1024, false),
};

void runGrowth(benchmark::State& state, const Case& measured) {
    setDeviceCount(measured.devices);
    Service service;
    const std::string session = R"("session_id":")" + service.openSession("Mod1") + '"';
    const std::string request = measured.make(session, state.range(0));
    if (isSuccess(service.answer(request)) != measured.succeeds) {
        state.SkipWithError("another outcome than expected");
    }
    for (auto _ : state) {
        benchmark::DoNotOptimize(service.answer(request));
    }
    state.SetComplexityN(state.range(0));
    setDeviceCount(defaultDeviceCount);
}

const bool registered = [] {
    for (const Case& measured : cases) {
        benchmark::RegisterBenchmark((std::string("growth/") + measured.name).c_str(), runGrowth,
                                     measured)
            ->RangeMultiplier(4)
            ->Range(measured.first, measured.last)
            ->Complexity();
    }
    return true;
}();

}  // namespace
