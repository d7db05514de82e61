#pragma once

#include "qitrmcwebsvc/SingleRequest.h"

namespace nQITRMCWEBSVC100 {

// Decides whether a request has the parameters that its method asks for.
class ISchemaValidator {
  public:
    virtual ~ISchemaValidator() = default;

    // Returns when the request conforms. Otherwise throws BasicError: with invalidRequest when
    // "params" is not an object, and with invalidParams for any other fault. May be called by
    // several threads at once.
    virtual void validate(const SingleRequest& request) = 0;
};

}  // namespace nQITRMCWEBSVC100
