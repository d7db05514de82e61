#include "Service.h"

#include <stdexcept>

std::string Service::request(const std::string& method, const std::string& params) {
    return R"({"jsonrpc":"2.0","id":1,"method":")" + method + R"(","params":{)" + params + "}}";
}

std::string Service::openSession(const std::string& devices) {
    const std::string response = answer(
        request("initializeSession", devices.empty() ? "" : R"("devices":")" + devices + '"'));
    const std::size_t begin = response.find("_session");
    if (begin == std::string::npos) {
        throw std::runtime_error("no session: " + response);
    }
    return response.substr(begin, response.find('"', begin) - begin);
}

bool isSuccess(const std::string& response) {
    return response.find("\"error\":") == std::string::npos;
}
