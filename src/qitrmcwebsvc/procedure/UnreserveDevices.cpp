#include "qitrmcwebsvc/procedure/UnreserveDevices.h"

#include "qitrmcwebsvc/RequestResource.h"

namespace nQITRMCWEBSVC100 {

void UnreserveDevices::run(const JsonValue& params, const std::shared_ptr<SessionContext>& session,
                           SingleResponse& response) {
    const RequestResource resource(params, session->driverSession, ResourceKind::Device);
    sessionManager->unreserveDevices(sessionIdOf(params), resource.names());
    response.setEmptyResult();
}

}  // namespace nQITRMCWEBSVC100
