#pragma once

#include <ws_runtime.h>

#include <string>

// One HTTP request and its response in the making: what the host and the runtime library share.
//
// The host fills in the request, the plug-in reads it and writes the response through the runtime's
// functions, the host sends the response. Used by one thread at a time.
struct ws_Request {
    std::string transport;  // "http" or "https"
    std::string method;     // as the client sent it
    std::string body;       // at most UINT32_MAX bytes

    int code = 200;
    std::string type = "text/plain";
    std::string output;
    bool incomplete = false;  // memory ran out while the response was written
};
