#pragma once

#include "qitrmcwebsvc/SingleRequest.h"
#include "qitrmcwebsvc/SingleResponse.h"

namespace nQITRMCWEBSVC100 {

// One JSON-RPC method. One object serves any number of requests at once.
class IProcedure {
  public:
    virtual ~IProcedure() = default;

    // Checks the request against the method's schema, does the work and sets the result. Failure is
    // an exception of the family std::exception; nothing has been set in the response then.
    virtual void execute(const SingleRequest& request, SingleResponse& response) = 0;
};

}  // namespace nQITRMCWEBSVC100
