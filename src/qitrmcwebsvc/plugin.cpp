// The exported functions of the plug-in, which the embedded web server calls.

#include <ws_runtime.h>

#include <cstdint>
#include <exception>
#include <memory>
#include <new>
#include <string>

#include "ini/IniFile.h"
#include "qi/dsc/WideString.h"
#include "qisysq/installRoot.h"
#include "qitrmcwebsvc/RequestHandler.h"
#include "qitrmcwebsvc/httpRequest.h"

#define QITRMC_EXPORT extern "C" __attribute__((visibility("default")))

using namespace nQITRMCWEBSVC100;

namespace {

constexpr int httpNotFound = 404;
constexpr int httpBadRequest = 400;
constexpr int httpServerError = 500;

// Whether the switch was on at the last qitrmcInit.
bool webServiceEnabled = false;
// The only request handler of the process. It is kept if a later qitrmcInit finds the switch off.
std::unique_ptr<RequestHandler> requestHandler;

struct IniFileOwner {
    void operator()(IniFile* file) const { IniFile_destroy(file); }
};

bool readSwitch() {
    const std::unique_ptr<IniFile, IniFileOwner> file(IniFile_create());
    if (!file) {
        throw std::bad_alloc();
    }
    const std::string path = std::string(qisysq_installRoot()) + "/etc/qinstal/share/qitrmc.ini";
    // If the file cannot be read, the file object stays empty and the service is disabled.
    IniFile_load(file.get(), path.c_str());
    std::uint32_t enable = 0;
    return IniFile_getInt(file.get(), "WebService", "Enable", &enable) > 0 && enable != 0;
}

void refuse(ws_Request* request, int code, const std::string& text) {
    SetHTTPResponseCode_QI_QVWS_(request, code);
    writeOutput(request, text);
}

bool variableIs(ws_Request* request, const char* name, const char* required) {
    std::string value;
    return readRequestVariable(request, name, value) == 0 && value == required;
}

bool cameThroughCall(const ws_Entry* entry) {
    const ws_WideString name = entry->operations->entryName(entry);
    return qi::dsc::equalsIgnoringCase(qi::dsc::WideString(name.begin, name.end),
                                       qi::dsc::WideString("Call"));
}

// Checks the HTTP request and, if it is acceptable, processes its body. The checks have a fixed
// order, which decides the response to a request that fails several of them.
void serve(ws_Entry* entry, ws_Request* request) {
    if (!variableIs(request, "REQUEST_TRANSPORT", "http")) {
        return refuse(request, httpNotFound, "Only HTTP protocol is supported.");
    }
    if (!variableIs(request, "REQUEST_METHOD", "POST")) {
        return refuse(request, httpNotFound, "Only HTTP POST request is supported.");
    }
    if (!cameThroughCall(entry)) {
        return SetHTTPResponseCode_QI_QVWS_(request, httpNotFound);
    }
    std::string body;
    if (readPostBody(request, body) != 0) {
        return SetHTTPResponseCode_QI_QVWS_(request, httpBadRequest);
    }
    // If the last qitrmcInit failed, the flag is set but there is no request handler.
    if (!requestHandler) {
        return SetHTTPResponseCode_QI_QVWS_(request, httpServerError);
    }
    const std::string response = requestHandler->handleRequest(body);
    SetHTTPResponseMimeType_C_REST_QI_QVWS_(request, "application/json; charset=utf-8");
    writeOutput(request, response);
}

}  // namespace

QITRMC_EXPORT void qitrmcInit() {
    webServiceEnabled = readSwitch();
    if (webServiceEnabled) {
        requestHandler = std::make_unique<RequestHandler>();
    }
}

QITRMC_EXPORT void qitrmcPause() {}

QITRMC_EXPORT void qitrmcResume() {}

QITRMC_EXPORT void qitrmcFinalize() {
    requestHandler.reset();
}

QITRMC_EXPORT void qitrmcRun(ws_Entry* entry, ws_Request* request) {
    if (!webServiceEnabled) {
        return refuse(request, httpNotFound,
                      "QI-TRMC web server is disabled. Please enable it in QI-DESK.");
    }
    try {
        serve(entry, request);
    } catch (const std::exception&) {
        SetHTTPResponseCode_QI_QVWS_(request, httpServerError);
    }
}
