#pragma once

#include "qitrmcwebsvc/SingleRequest.h"
#include "qitrmcwebsvc/SingleResponse.h"

namespace nQITRMCWEBSVC100 {

// One JSON-RPC method. One object executes any number of requests concurrently.
class IProcedure {
  public:
    virtual ~IProcedure() = default;

    // Checks the request against the method's schema, executes it and sets the result. On failure
    // throws an exception derived from std::exception, with the response unchanged.
    virtual void execute(const SingleRequest& request, SingleResponse& response) = 0;
};

}  // namespace nQITRMCWEBSVC100
