#include "qitrmcwebsvc/procedure/CommitProperties.h"

#include <qitrmcapi.h>

#include "qitrmcwebsvc/RequestResource.h"
#include "qitrmcwebsvc/callDriver.h"

namespace nQITRMCWEBSVC100 {

void CommitProperties::run(const JsonValue& params, const std::shared_ptr<SessionContext>& session,
                           SingleResponse& response) {
    const RequestResource resource(params, session->driverSession, session->defaultResourceKind);
    callDriver(nQITRMCAPI100_commitPropertiesGeneric, session->driverSession,
               resource.joinedNames().c_str());
    response.setEmptyResult();
}

}  // namespace nQITRMCWEBSVC100
