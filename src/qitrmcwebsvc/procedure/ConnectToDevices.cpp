#include <qitrmcapi.h>

#include "qitrmcwebsvc/RequestResource.h"
#include "qitrmcwebsvc/callDriver.h"
#include "qitrmcwebsvc/procedure/procedures.h"

namespace nQITRMCWEBSVC100 {
namespace {

constexpr double driverChoosesTimeout = -1.0;

}  // namespace

// Connects devices of the session, with the driver's default timeout. Result: an empty object.
void ConnectToDevices::run(const JsonValue& params, SingleResponse& response) const {
    const std::shared_ptr<SessionContext> session = sessionOf(params);
    const RequestResource resource(params, session->driverSession, ResourceKind::Device);
    callDriver(nQITRMCAPI100_connectToDevices, session->driverSession,
               resource.joinedNames().c_str(), driverChoosesTimeout);
    response.setEmptyResult();
}

}  // namespace nQITRMCWEBSVC100
