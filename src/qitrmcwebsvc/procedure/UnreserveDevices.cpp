#include "qitrmcwebsvc/RequestResource.h"
#include "qitrmcwebsvc/procedure/procedures.h"

namespace nQITRMCWEBSVC100 {

// Releases devices that the session has reserved. Result: an empty object.
void UnreserveDevices::run(const JsonValue& params, SingleResponse& response) const {
    const std::shared_ptr<SessionContext> session = sessionOf(params);
    const RequestResource resource(params, session->driverSession, ResourceKind::Device);
    sessionManager->unreserveDevices(sessionIdOf(params), resource.names());
    response.setEmptyResult();
}

}  // namespace nQITRMCWEBSVC100
