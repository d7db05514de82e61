#include "qitrmcwebsvc/procedure/AbortSession.h"

#include <qitrmcapi.h>

#include "qitrmcsharedcmn/Exceptions.h"

namespace nQITRMCWEBSVC100 {

void AbortSession::run(const JsonValue&, const std::shared_ptr<SessionContext>& session,
                       SingleResponse& response) {
    {
        nQITRMCSHAREDCMN100::ThrowingStatus status;
        nQITRMCAPI100_abortSession(session->driverSession, &status);
    }
    response.setEmptyResult();
}

}  // namespace nQITRMCWEBSVC100
