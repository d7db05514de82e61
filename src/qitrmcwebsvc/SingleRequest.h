#pragma once

#include <string>

#include "qitrmcwebsvc/Json.h"

namespace nQITRMCWEBSVC100 {

// One JSON-RPC request whose envelope is sound: "id" is an integer of 32 bits or a string,
// "jsonrpc" is "2.0", and "method" is a string. What the other members hold is for others to check.
class SingleRequest {
  public:
    // Checks the envelope and takes `value` over, which becomes null. Its strings and members stay
    // in the pool of their document, which must outlive this object. On failure `value` stays as it
    // was and a BasicError with invalidRequest is thrown.
    explicit SingleRequest(JsonValue& value);
    virtual ~SingleRequest() = default;

    // The whole request object.
    const JsonValue& getRequest() const { return request; }

    // The member "params", of whatever type, or a null value when there is none.
    const JsonValue& getParams() const;

    // The member "method" up to its first NUL.
    const std::string& getMethod() const { return method; }

  private:
    JsonValue request;
    std::string method;
};

}  // namespace nQITRMCWEBSVC100
