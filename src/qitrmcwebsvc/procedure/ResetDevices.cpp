#include <qitrmcapi.h>

#include "qitrmcwebsvc/RequestResource.h"
#include "qitrmcwebsvc/callDriver.h"
#include "qitrmcwebsvc/procedure/procedures.h"

namespace nQITRMCWEBSVC100 {

// Resets devices to their power-on state. Result: an empty object.
void ResetDevices::run(const JsonValue& params, SingleResponse& response) const {
    const std::shared_ptr<SessionContext> session = sessionOf(params);
    const RequestResource resource(params, session->driverSession, ResourceKind::Device);
    callDriver(nQITRMCAPI100_resetDevices, session->driverSession, resource.joinedNames().c_str());
    response.setEmptyResult();
}

}  // namespace nQITRMCWEBSVC100
