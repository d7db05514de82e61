#pragma once

#include <string>

#include "qitrmcwebsvc/Json.h"

namespace nQITRMCWEBSVC100 {

// One JSON-RPC request with a valid envelope: "id" is a 32-bit integer or a string, "jsonrpc" is
// "2.0", and "method" is a string. The other members are not checked here.
class SingleRequest {
  public:
    // Checks the envelope and moves `value` into this object. Its memory belongs to the allocator
    // of its document, which must outlive this object. On failure throws BasicError invalidRequest,
    // with `value` unchanged.
    explicit SingleRequest(JsonValue& value);
    virtual ~SingleRequest() = default;

    // The whole request object.
    const JsonValue& getRequest() const { return request; }

    // The member "params", of whatever type, or a null value if there is none.
    const JsonValue& getParams() const;

    // The member "method" up to its first NUL.
    const std::string& getMethod() const { return method; }

  private:
    JsonValue request;
    std::string method;
    const JsonValue* params;  // in the request, or null
};

}  // namespace nQITRMCWEBSVC100
