#pragma once

#include "qitrmcsharedcmn/Exceptions.h"

namespace nQITRMCWEBSVC100 {

// Calls a function of the driver with these arguments and a status, and throws qierr::Exception
// when the status comes back negative.
template <typename... Parameters, typename... Arguments>
void callDriver(void (*function)(Parameters...), Arguments... arguments) {
    nQITRMCSHAREDCMN100::ThrowingStatus status;
    function(arguments..., &status);
}

}  // namespace nQITRMCWEBSVC100
