// Handles ten standard requests, each once in a call of countedRequest() after it was handled
// twice: what the second one could keep, the third one uses. bench/instructions.py counts the
// instructions of these calls. Prints the names in the same order.

#include <cstdio>
#include <cstdlib>
#include <string>
#include <utility>
#include <vector>

#include "Service.h"

namespace {

using Requests = std::vector<std::pair<const char*, std::string>>;

std::string batchOf(const std::string& request, int count) {
    std::string batch = "[" + request;
    for (int i = 1; i < count; ++i) {
        batch += "," + request;
    }
    return batch + "]";
}

Requests standardRequests(Service& service) {
    const std::string session = R"("session_id":")" + service.openSession("Mod1") + '"';
    const auto request = [&](const char* method, const char* params) {
        return Service::request(method, session + params);
    };
    const std::string get =
        request("getProperty", R"(,"devices":["Mod9"],"property":"Dev.Temperature")");
    return {
        {"initializeSession", Service::request("initializeSession", "")},
        {"getProperty", get},
        {"getProperty of 4 devices",
         request("getProperty",
                 R"(,"devices":"Mod1,Mod2,Mod3,Mod4","property":"Dev.Temperature")")},
        {"setProperty",
         request("setProperty",
                 R"(,"devices":["Mod9"],"property":"Dev.Temperature","value":36.5)")},
        {"getSessionPropertyList", request("getSessionPropertyList", "")},
        {"readRegister", request("readRegister", R"(,"device":"Mod9","address":4096,"size":32)")},
        {"getNvmemBytes of 64 KiB",
         request("getNvmemBytes", R"(,"nvmem_area":"Mod1/user","address":0,"size":65536)")},
        {"batch of 100 getProperty", batchOf(get, 100)},
        {"unknown session", Service::request("closeSession", R"("session_id":"_session0")")},
        {"unknown device",
         request("getProperty", R"(,"devices":["Mod99"],"property":"Dev.Temperature")")},
    };
}

bool isExpected(const std::string& name, const std::string& response) {
    return isSuccess(response) == (name.rfind("unknown", 0) != 0);
}

}  // namespace

extern "C" __attribute__((noinline)) std::size_t countedRequest(Service& service,
                                                                const std::string& request) {
    return service.answer(request).size();
}

int main() {
    Service service;
    for (const auto& [name, request] : standardRequests(service)) {
        service.answer(request);
        const std::string response = service.answer(request);
        if (!isExpected(name, response)) {
            std::fprintf(stderr, "%s: %s\n", name, response.c_str());
            return EXIT_FAILURE;
        }
        if (countedRequest(service, request) == 0) {
            return EXIT_FAILURE;
        }
        std::puts(name);
    }
    return EXIT_SUCCESS;
}
