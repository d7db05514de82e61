// Requests on the driver that costs nothing, each beside its floor: what the JSON library alone
// takes to parse, validate and print the same texts.

#include <benchmark/benchmark.h>

#include <memory>
#include <string>

#include "Floor.h"
#include "Service.h"

namespace {

struct Case {
    const char* name;
    const char* method;
    const char* schemaFile;
    const char* params;  // what follows the session id
    int elements;        // 0: a single request, else the size of a batch
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
    if (measured.elements == 0)
        return one;
    std::string batch;
    for (int i = 0; i < measured.elements; ++i)
        batch += (i == 0 ? "[" : ",") + one;
    return batch + "]";
}

void runRoad(benchmark::State& state, const Case& measured) {
    Service service;
    const std::string text = textOf(measured, service.openSession("Mod1"));
    if (!isSuccess(service.answer(text)))
        state.SkipWithError(service.answer(text).c_str());
    for (auto _ : state)
        benchmark::DoNotOptimize(service.answer(text));
}

void runFloor(benchmark::State& state, const Case& measured) {
    Service service;
    const std::string text = textOf(measured, service.openSession("Mod1"));
    const std::string response = service.answer(text);
    const Floor floor(measured.schemaFile, text, response);
    // Numbers may be printed in another form than they were sent in, but not here.
    if (floor.run() != response.size())
        state.SkipWithError("the floor does not print the response");
    for (auto _ : state)
        benchmark::DoNotOptimize(floor.run());
}

const bool registered = [] {
    for (const Case& measured : cases) {
        const std::string name = std::string("/") + measured.name;
        benchmark::RegisterBenchmark(("road" + name).c_str(), runRoad, measured);
        benchmark::RegisterBenchmark(("floor" + name).c_str(), runFloor, measured);
    }
    return true;
}();

}  // namespace
