// Measures calls of the simulated driver, and a whole request of the service with that driver:
// qitrmc-bench-driver DEVICES [options of the benchmark library]. The chassis has as many devices
// as the first argument says, each with two channels; the library reads it once, so another number
// needs another process.

#include <benchmark/benchmark.h>
#include <unistd.h>

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <fstream>
#include <string>

#include "Service.h"
#include "qierr_status.h"
#include "qitrmcapi.h"

namespace {

// A status without memory for details.
struct Status : qierr_Status {
    Status() : qierr_Status{} {
        reallocJson = [](qierr_Status*, std::uint32_t) -> int { return 0; };
    }
};

std::string device;
nQITRMCAPI100_Session session = 0;

std::string description(int devices) {
    std::string text = R"({"enums": {}, "devices": [)";
    for (int i = 0; i < devices; ++i) {
        text += std::string(i == 0 ? "" : ",") + R"({"name": "Module)" + std::to_string(i) +
                R"(", "category": 7, "properties": {
                    "Level.Set": {"type": "Double", "value": 1.5, "access": "ReadWrite"},
                    "Level.Text": {"type": "String", "value": "a text of some length"},
                    "Level.Now": {"type": "Double", "value": 0}},
                "live": {"Level.Now": {"follows": {"property": "Level.Set"}, "noise": 0.1}},
                "registers": [{"address": 0, "size": 16}],
                "channels": {"prefix": "ch", "count": 2, "properties": {
                    "Level.Set": {"type": "Double", "value": 2.5, "access": "ReadWrite"}}}})";
    }
    return text + "]}";
}

void expectSuccess(benchmark::State& state, const qierr_Status& status) {
    if (status.code != 0) {
        state.SkipWithError(("The driver failed with " + std::to_string(status.code)).c_str());
    }
}

void readDouble(benchmark::State& state, const char* part, const char* property) {
    const std::string resource = device + part;
    Status status;
    for (auto _ : state) {
        double value = 0;
        nQITRMCAPI100_getGenericPropertyDouble(session, resource.c_str(), property, &value,
                                               &status);
        benchmark::DoNotOptimize(value);
    }
    expectSuccess(state, status);
}

void readText(benchmark::State& state) {
    Status status;
    for (auto _ : state) {
        char* text = nullptr;
        nQITRMCAPI100_getGenericPropertyString(session, device.c_str(), "Level.Text", &text,
                                               &status);
        nQITRMCAPI100_freeString(text);
    }
    expectSuccess(state, status);
}

void writeDouble(benchmark::State& state) {
    Status status;
    for (auto _ : state) {
        nQITRMCAPI100_setGenericPropertyDouble(session, device.c_str(), "Level.Set", 1.5, &status);
    }
    expectSuccess(state, status);
}

void readRegister(benchmark::State& state) {
    Status status;
    for (auto _ : state) {
        std::uint32_t value = 0;
        nQITRMCAPI100_readRegisterUInt32(session, device.c_str(), 4, &value, &status);
        benchmark::DoNotOptimize(value);
    }
    expectSuccess(state, status);
}

void readNames(benchmark::State& state, const char* property) {
    Status status;
    for (auto _ : state) {
        char** names = nullptr;
        std::uint32_t count = 0;
        nQITRMCAPI100_getSystemPropertyStringArray(session, property, &names, &count, &status);
        nQITRMCAPI100_freeStringArray(names, count);
    }
    expectSuccess(state, status);
}

void readReserved(benchmark::State& state) {
    Status status;
    for (auto _ : state) {
        char** names = nullptr;
        std::uint32_t count = 0;
        nQITRMCAPI100_getSessionPropertyStringArray(session, "Session.ReservedDevices", &names,
                                                    &count, &status);
        nQITRMCAPI100_freeStringArray(names, count);
    }
    expectSuccess(state, status);
}

void readAttribute(benchmark::State& state) {
    Status status;
    for (auto _ : state) {
        nQITRMCAPI100_Property handle = 0;
        std::int32_t type = 0;
        nQITRMCAPI100_openGenericProperty(session, device.c_str(), "Level.Set", &handle, &status);
        nQITRMCAPI100_getPropertyPropertyInt32(handle, "Prop.DataType", &type, &status);
        nQITRMCAPI100_closeProperty(handle, &status);
        benchmark::DoNotOptimize(type);
    }
    expectSuccess(state, status);
}

void openSession(benchmark::State& state) {
    Status status;
    for (auto _ : state) {
        nQITRMCAPI100_Session opened = 0;
        nQITRMCAPI100_initializeSessionWithDevices(&opened, device.c_str(), 1.0, 3, "bench", 0.0,
                                                   &status);
        nQITRMCAPI100_closeSession(opened, &status);
    }
    expectSuccess(state, status);
}

void getProperty(benchmark::State& state) {
    Service service;
    const std::string request = Service::request(
        "getProperty", R"("session_id":")" + service.openSession() + R"(","devices":[")" + device +
                           R"("],"property":"Level.Set")");
    if (!isSuccess(service.answer(request))) {
        state.SkipWithError(service.answer(request).c_str());
    }
    for (auto _ : state) {
        benchmark::DoNotOptimize(service.answer(request));
    }
}

void registerBenchmarks(const std::string& devices) {
    const auto add = [&](const char* name, auto&&... arguments) {
        return benchmark::RegisterBenchmark(("driver/" + devices + "/" + name).c_str(),
                                            arguments...);
    };
    add("readDouble", readDouble, "", "Level.Set");
    add("readDoubleOfChannel", readDouble, "/ch1", "Level.Set");
    add("readDouble", readDouble, "", "Level.Set")->Threads(2)->UseRealTime();
    add("readMovingDouble", readDouble, "", "Level.Now");
    add("readText", readText);
    add("writeDouble", writeDouble);
    add("readRegister", readRegister);
    add("readAttribute", readAttribute);
    add("readPropertyNames", readNames, "Sys.DeviceProperties");
    add("readDeviceNames", readNames, "Sys.Devices");
    add("readReservedNames", readReserved);
    add("openAndCloseSession", openSession);
    add("getProperty", getProperty);
}

}  // namespace

int main(int count, char** arguments) {
    const int devices = count > 1 ? std::atoi(arguments[1]) : 0;
    if (devices < 1) {
        std::fprintf(stderr, "Usage: %s DEVICES [OPTION]...\n", arguments[0]);
        return 2;
    }
    char path[] = "/tmp/qitrmc-bench-XXXXXX";
    const int file = mkstemp(path);
    std::ofstream(path) << description(devices);
    setenv("QITRMC_SIM_CHASSIS", path, 1);
    device = "Module" + std::to_string(devices / 2);
    Status status;
    nQITRMCAPI100_initializeSessionWithDevices(&session, device.c_str(), 1.0, 3, "bench", 0.0,
                                               &status);
    close(file);
    std::remove(path);
    if (status.code != 0) {
        std::fprintf(stderr, "The driver failed with %d\n", static_cast<int>(status.code));
        return 1;
    }
    registerBenchmarks(std::to_string(devices));
    --count;
    arguments[1] = arguments[0];
    benchmark::Initialize(&count, arguments + 1);
    benchmark::RunSpecifiedBenchmarks();
    nQITRMCAPI100_closeSession(session, &status);
    return 0;
}
