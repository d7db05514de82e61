#pragma once

#include <qitrmcapi.h>

#include <cstdint>

#include "qitrmcwebsvc/ResourceKind.h"

namespace nQITRMCWEBSVC100 {

// What the service remembers of an open session. All else lives in the driver, behind the handle.
//
// Plain data with shared owners: the session manager's table is one, each request that uses the
// session another. Its end has no effect on the driver, so a request may outlive the driver session
// and is then refused by the driver.
struct SessionContext {
    // The kind of the resources on which the session was opened. Never changes.
    ResourceKind defaultResourceKind = ResourceKind::None;
    // The access of the latest reservation; 0 before one and after a release. Read and written
    // under the session manager's mutex.
    std::int32_t access = 0;
    // The driver's handle. Never changes.
    nQITRMCAPI100_Session driverSession = 0;
};

}  // namespace nQITRMCWEBSVC100
