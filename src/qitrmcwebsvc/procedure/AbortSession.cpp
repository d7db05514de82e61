#include <qitrmcapi.h>

#include "qitrmcwebsvc/callDriver.h"
#include "qitrmcwebsvc/procedure/procedures.h"

namespace nQITRMCWEBSVC100 {

// Aborts all calls of a session that wait in the driver. The session stays open and must still be
// closed. Result: an empty object.
void AbortSession::run(const JsonValue& params, SingleResponse& response) const {
    const std::shared_ptr<SessionContext> session = sessionOf(params);
    callDriver(nQITRMCAPI100_abortSession, session->driverSession);
    response.setEmptyResult();
}

}  // namespace nQITRMCWEBSVC100
