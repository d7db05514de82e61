#include "qitrmcwebsvc/procedure/ConnectToDevices.h"

#include <qitrmcapi.h>

#include "qitrmcwebsvc/RequestResource.h"
#include "qitrmcwebsvc/callDriver.h"

namespace nQITRMCWEBSVC100 {
namespace {

constexpr double driverChoosesTimeout = -1.0;

}  // namespace

void ConnectToDevices::run(const JsonValue& params, const std::shared_ptr<SessionContext>& session,
                           SingleResponse& response) {
    const RequestResource resource(params, session->driverSession, ResourceKind::Device);
    callDriver(nQITRMCAPI100_connectToDevices, session->driverSession,
               resource.joinedNames().c_str(), driverChoosesTimeout);
    response.setEmptyResult();
}

}  // namespace nQITRMCWEBSVC100
