#pragma once

#include <string>

#include "qitrmcwebsvc/RequestHandler.h"

// The service with the driver of FreeDriver.cpp.
class Service {
  public:
    // A request of a method; `params` is the text between the braces of its params object.
    static std::string request(const std::string& method, const std::string& params);

    // Opens a session and returns its id. `devices` may be empty.
    std::string openSession(const std::string& devices = "");

    std::string answer(const std::string& body) { return handler.handleRequest(body); }

  private:
    nQITRMCWEBSVC100::RequestHandler handler;
};

// Whether a response and all its elements report success.
bool isSuccess(const std::string& response);
