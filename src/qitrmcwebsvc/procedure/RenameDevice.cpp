#include <qitrmcapi.h>

#include "qitrmcwebsvc/callDriver.h"
#include "qitrmcwebsvc/procedure/procedures.h"

namespace nQITRMCWEBSVC100 {

// Renames one device. Its name is passed to the driver without a check. Result: an empty object.
void RenameDevice::run(const JsonValue& params, SingleResponse& response) const {
    const std::shared_ptr<SessionContext> session = sessionOf(params);
    const std::string device = textParam(params, "device");
    const std::string newName = textParam(params, "new_device_name");
    callDriver(nQITRMCAPI100_renameDevice, session->driverSession, device.c_str(), newName.c_str());
    response.setEmptyResult();
}

}  // namespace nQITRMCWEBSVC100
