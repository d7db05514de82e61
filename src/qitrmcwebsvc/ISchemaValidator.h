#pragma once

#include "qitrmcwebsvc/SingleRequest.h"

namespace nQITRMCWEBSVC100 {

// Checks whether a request has the parameters that its method requires.
class ISchemaValidator {
  public:
    virtual ~ISchemaValidator() = default;

    // Returns if the request is valid. Otherwise throws BasicError: with invalidRequest if "params"
    // is not an object, and with invalidParams for any other error. May be called by several
    // threads concurrently.
    virtual void validate(const SingleRequest& request) = 0;
};

}  // namespace nQITRMCWEBSVC100
