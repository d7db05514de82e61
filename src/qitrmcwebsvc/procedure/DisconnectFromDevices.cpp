#include "qitrmcwebsvc/procedure/DisconnectFromDevices.h"

#include <qitrmcapi.h>

#include "qitrmcwebsvc/RequestResource.h"
#include "qitrmcwebsvc/callDriver.h"

namespace nQITRMCWEBSVC100 {

void DisconnectFromDevices::run(const JsonValue& params,
                                const std::shared_ptr<SessionContext>& session,
                                SingleResponse& response) {
    const RequestResource resource(params, session->driverSession, ResourceKind::Device);
    callDriver(nQITRMCAPI100_disconnectFromDevices, session->driverSession,
               resource.joinedNames().c_str());
    response.setEmptyResult();
}

}  // namespace nQITRMCWEBSVC100
