#include "qitrmcwebsvc/procedure/GetModuleName.h"

#include <algorithm>

#include "qitrmcwebsvc/procedure/chassis.h"
#include "qitrmcwebsvc/procedure/jsonValues.h"

namespace nQITRMCWEBSVC100 {

void GetModuleName::run(const JsonValue& params, const std::shared_ptr<SessionContext>& session,
                        SingleResponse& response) {
    const RequestResource resource(params, session->driverSession, session->defaultResourceKind);
    requireChassis(resource, session);
    const std::vector<std::string> modules = modulesOf(resource, session);
    const std::uint32_t slot = uintParam(params, "slot_number");

    JsonPool& pool = *response.getAllocator();
    ScratchParams scratch(pool);
    const auto slotMatches = [&](const std::string& module) {
        return slotOf(module, scratch, session) == slot;
    };
    const auto found = std::find_if(modules.begin(), modules.end(), slotMatches);
    const bool present = found != modules.end();

    JsonValue result(rapidjson::kObjectType);
    if (present)
        result.AddMember("module", textValue(*found, pool), pool);
    result.AddMember("present", present, pool);
    response.setResult(result);
}

}  // namespace nQITRMCWEBSVC100
