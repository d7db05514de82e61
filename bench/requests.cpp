// Measures requests with a driver whose functions do almost nothing ("road"), and as the lower
// bound the JSON library alone, which parses, validates and prints the same texts ("floor").

#include <benchmark/benchmark.h>

#include <memory>
#include <string>

#include "JsonBaseline.h"
#include "Service.h"

namespace {

struct Case {
    const char* name;
    const char* method;
    const char* schemaFile;
    const char* params;  // the params after the session id
    int elements;        // the size of a batch, 0 for a single request
};

constexpr const char* getPropertySchema = "procedure_get_property.json";
constexpr const char* temperature = R"(,"devices":["Mod9"],"property":"Dev.Temperature")";

const Case cases[] = {
    {"getProperty", "getProperty", getPropertySchema, temperature, 0},
    {"setProperty", "setProperty", "procedure_set_property.json",
     R"(,"devices":["Mod9"],"property":"Dev.Temperature","value":36.5)", 0},
    {"readRegister", "readRegister", "procedure_read_register.json",
     R"(,"device":"Mod9","address":4096,"size":32)", 0},
    {"batchOf100", "getProperty", getPropertySchema, temperature, 100},
    {"getNvmemBytes64KiB", "getNvmemBytes", "procedure_get_nvmem_bytes.json",
     R"(,"nvmem_area":"Mod1/user","address":0,"size":65536)", 0},
};

std::string textOf(const Case& measured, const std::string& session) {
    const std::string one =
        Service::request(measured.method, R"("session_id":")" + session + '"' + measured.params);
    if (measured.elements == 0) {
        return one;
    }
    std::string batch;
    for (int i = 0; i < measured.elements; ++i) {
        batch += (i == 0 ? "[" : ",") + one;
    }
    return batch + "]";
}

void runService(benchmark::State& state, const Case& measured) {
    Service service;
    const std::string text = textOf(measured, service.openSession("Mod1"));
    if (!isSuccess(service.answer(text))) {
        state.SkipWithError(service.answer(text).c_str());
    }
    for (auto _ : state) {
        benchmark::DoNotOptimize(service.answer(text));
    }
}

void runBaseline(benchmark::State& state, const Case& measured) {
    Service service;
    const std::string text = textOf(measured, service.openSession("Mod1"));
    const std::string response = service.answer(text);
    const JsonBaseline baseline(measured.schemaFile, text, response);
    // The baseline prints the numbers of these responses in the same form as the service.
    if (baseline.run() != response.size()) {
        state.SkipWithError("the floor does not print the response");
    }
    for (auto _ : state) {
        benchmark::DoNotOptimize(baseline.run());
    }
}

const bool registered = [] {
    for (const Case& measured : cases) {
        const std::string name = std::string("/") + measured.name;
        benchmark::RegisterBenchmark(("road" + name).c_str(), runService, measured);
        benchmark::RegisterBenchmark(("floor" + name).c_str(), runBaseline, measured);
    }
    return true;
}();

}  // namespace
