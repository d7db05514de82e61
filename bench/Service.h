#pragma once

#include <string>

#include "qitrmcwebsvc/RequestHandler.h"

// The service on the free driver.
class Service {
  public:
    // A request of a method; `params` is the inside of its params object.
    static std::string request(const std::string& method, const std::string& params);

    // Opens a session and returns its id. `devices` may be empty.
    std::string openSession(const std::string& devices = "");

    std::string answer(const std::string& body) { return handler.handleRequest(body); }

  private:
    nQITRMCWEBSVC100::RequestHandler handler;
};

// Whether a response reports success, in all its elements.
bool isSuccess(const std::string& response);
