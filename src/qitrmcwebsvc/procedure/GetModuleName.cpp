#include <algorithm>

#include "qitrmcwebsvc/procedure/chassis.h"
#include "qitrmcwebsvc/procedure/jsonValues.h"
#include "qitrmcwebsvc/procedure/procedures.h"

namespace nQITRMCWEBSVC100 {

// Finds the module in a slot of a chassis. Throws BasicError notChassis if the device is not a
// chassis. Result: module, if there is one, and present.
void GetModuleName::run(const JsonValue& params, SingleResponse& response) const {
    const std::shared_ptr<SessionContext> session = sessionOf(params);
    const RequestResource resource(params, *session);
    requireChassis(resource, session);
    const std::vector<std::string> modules = modulesOf(resource, session);
    const std::uint32_t slot = uintParam(params, "slot_number");

    JsonAllocator& allocator = *response.getAllocator();
    ScratchParams scratch(allocator);
    const auto slotMatches = [&](const std::string& module) {
        return slotOf(module, scratch, session) == slot;
    };
    const auto found = std::find_if(modules.begin(), modules.end(), slotMatches);
    const bool present = found != modules.end();

    JsonValue result(rapidjson::kObjectType);
    if (present) {
        result.AddMember("module", textValue(*found, allocator), allocator);
    }
    result.AddMember("present", present, allocator);
    response.setResult(std::move(result));
}

}  // namespace nQITRMCWEBSVC100
