#include "qitrmcwebsvc/procedure/CommitNvmemAreas.h"

#include <qitrmcapi.h>

#include "qitrmcwebsvc/RequestResource.h"
#include "qitrmcwebsvc/callDriver.h"

namespace nQITRMCWEBSVC100 {

void CommitNvmemAreas::run(const JsonValue& params, const std::shared_ptr<SessionContext>& session,
                           SingleResponse& response) {
    const RequestResource resource(params, session->driverSession, session->defaultResourceKind);
    callDriver(nQITRMCAPI100_commitNvmemGeneric, session->driverSession,
               resource.joinedNames().c_str());
    response.setEmptyResult();
}

}  // namespace nQITRMCWEBSVC100
