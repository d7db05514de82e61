#include "qitrmcwebsvc/procedure/RenameChassisAndAllConnectedModules.h"

#include <qitrmcapi.h>

#include "qitrmcwebsvc/callDriver.h"
#include "qitrmcwebsvc/procedure/chassis.h"
#include "qitrmcwebsvc/procedure/jsonValues.h"

namespace nQITRMCWEBSVC100 {
namespace {

void rename(const SessionContext& session, const std::string& oldName, const std::string& newName) {
    callDriver(nQITRMCAPI100_renameDevice, session.driverSession, oldName.c_str(), newName.c_str());
}

}  // namespace

void RenameChassisAndAllConnectedModules::run(const JsonValue& params,
                                              const std::shared_ptr<SessionContext>& session,
                                              SingleResponse& response) {
    const std::string oldChassisName = textParam(params, "old_chassis_name");
    // The driver reads a text up to its first NUL, so that is where a new name ends.
    const std::string newChassisName = textParam(params, "new_chassis_name").c_str();
    JsonPool& pool = *response.getAllocator();
    ScratchParams chassisParams(pool);
    const RequestResource chassis = chassisParams.resourceFor(
        oldChassisName, session->driverSession, session->defaultResourceKind);
    requireChassis(chassis, session);

    ScratchParams moduleParams(pool);
    JsonValue newModuleNames(rapidjson::kArrayType);
    for (const std::string& module : modulesOf(chassis, session)) {
        const std::uint32_t slot = slotOf(module, moduleParams, session);
        const std::string newName = newChassisName + "-Mod" + std::to_string(slot);
        rename(*session, module, newName);
        newModuleNames.PushBack(textValue(newName, pool), pool);
    }
    rename(*session, oldChassisName, newChassisName);

    JsonValue result(rapidjson::kObjectType);
    result.AddMember("new_module_names", newModuleNames, pool);
    result.AddMember("new_chassis_name", textValue(newChassisName, pool), pool);
    response.setResult(result);
}

}  // namespace nQITRMCWEBSVC100
