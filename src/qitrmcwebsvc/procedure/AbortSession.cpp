#include "qitrmcwebsvc/procedure/AbortSession.h"

#include <qitrmcapi.h>

#include "qitrmcwebsvc/callDriver.h"

namespace nQITRMCWEBSVC100 {

void AbortSession::run(const JsonValue&, const std::shared_ptr<SessionContext>& session,
                       SingleResponse& response) {
    callDriver(nQITRMCAPI100_abortSession, session->driverSession);
    response.setEmptyResult();
}

}  // namespace nQITRMCWEBSVC100
