#include <qitrmcapi.h>

#include "qitrmcwebsvc/callDriver.h"
#include "qitrmcwebsvc/procedure/chassis.h"
#include "qitrmcwebsvc/procedure/jsonValues.h"
#include "qitrmcwebsvc/procedure/procedures.h"

namespace nQITRMCWEBSVC100 {
namespace {

void rename(const SessionContext& session, const std::string& oldName, const std::string& newName) {
    callDriver(nQITRMCAPI100_renameDevice, session.driverSession, oldName.c_str(), newName.c_str());
}

}  // namespace

// Renames the modules of a chassis, to names made of its new name and their slots, and then the
// chassis.
//
// A failure is not rolled back: the modules that were already renamed keep their new names. Throws
// BasicError notChassis if the device is not a chassis. Result: new_module_names, new_chassis_name.
void RenameChassisAndAllConnectedModules::run(const JsonValue& params,
                                              SingleResponse& response) const {
    const std::shared_ptr<SessionContext> session = sessionOf(params);
    const std::string oldChassisName = textParam(params, "old_chassis_name");
    // The driver reads a text up to its first NUL, so the new name ends there.
    const std::string newChassisName = textParam(params, "new_chassis_name").c_str();
    JsonAllocator& allocator = *response.getAllocator();
    ScratchParams chassisParams(allocator);
    const RequestResource chassis = chassisParams.resourceFor(
        oldChassisName, session->driverSession, session->defaultResourceKind);
    requireChassis(chassis, session);

    ScratchParams moduleParams(allocator);
    JsonValue newModuleNames(rapidjson::kArrayType);
    for (const std::string& module : modulesOf(chassis, session)) {
        const std::uint32_t slot = slotOf(module, moduleParams, session);
        const std::string newName = newChassisName + "-Mod" + std::to_string(slot);
        rename(*session, module, newName);
        newModuleNames.PushBack(textValue(newName, allocator), allocator);
    }
    rename(*session, oldChassisName, newChassisName);

    JsonValue result(rapidjson::kObjectType);
    result.AddMember("new_module_names", newModuleNames, allocator);
    result.AddMember("new_chassis_name", textValue(newChassisName, allocator), allocator);
    response.setResult(std::move(result));
}

}  // namespace nQITRMCWEBSVC100
