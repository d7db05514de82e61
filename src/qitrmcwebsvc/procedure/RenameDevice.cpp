#include "qitrmcwebsvc/procedure/RenameDevice.h"

#include <qitrmcapi.h>

#include "qitrmcwebsvc/callDriver.h"

namespace nQITRMCWEBSVC100 {

void RenameDevice::run(const JsonValue& params, const std::shared_ptr<SessionContext>& session,
                       SingleResponse& response) {
    const std::string device = textParam(params, "device");
    const std::string newName = textParam(params, "new_device_name");
    callDriver(nQITRMCAPI100_renameDevice, session->driverSession, device.c_str(), newName.c_str());
    response.setEmptyResult();
}

}  // namespace nQITRMCWEBSVC100
