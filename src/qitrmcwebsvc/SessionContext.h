#pragma once

#include <qitrmcapi.h>

#include <cstdint>

#include "qitrmcwebsvc/ResourceKind.h"

namespace nQITRMCWEBSVC100 {

// The data that the service keeps for an open session. All other data is in the driver.
//
// Owned jointly by the session manager's table and by each request that uses the session.
// Destroying it has no effect on the driver. If the driver session is closed while a request uses
// it, the driver calls of that request fail.
struct SessionContext {
    // The kind of the resources on which the session was opened. Never changes.
    ResourceKind defaultResourceKind = ResourceKind::None;
    // The access of the latest reservation; 0 without a reservation and after a release. Protected
    // by the session manager's mutex.
    std::int32_t access = 0;
    // The driver's handle. Never changes.
    nQITRMCAPI100_Session driverSession = 0;
};

}  // namespace nQITRMCWEBSVC100
