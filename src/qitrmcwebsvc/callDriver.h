#pragma once

#include "qitrmcsharedcmn/Exceptions.h"

namespace nQITRMCWEBSVC100 {

// Calls a driver function with these arguments and a status. Throws qierr::Exception if the status
// is negative afterwards.
template <typename... Parameters, typename... Arguments>
void callDriver(void (*function)(Parameters...), Arguments... arguments) {
    nQITRMCSHAREDCMN100::ThrowingStatus status;
    function(arguments..., &status);
}

}  // namespace nQITRMCWEBSVC100
