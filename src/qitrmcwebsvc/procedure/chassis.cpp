#include "qitrmcwebsvc/procedure/chassis.h"

#include "qitrmcsharedcmn/Exceptions.h"
#include "qitrmcwebsvc/ResourceUtility.h"
#include "qitrmcwebsvc/SessionProperty.h"

namespace nQITRMCWEBSVC100 {
namespace {

constexpr std::int32_t chassisCategory = 1;

}  // namespace

ScratchParams::ScratchParams(JsonAllocator& allocator) : params(rapidjson::kObjectType) {
    params.AddMember("device", "", allocator);
}

RequestResource ScratchParams::resourceFor(const std::string& device,
                                           nQITRMCAPI100_Session driverSession,
                                           ResourceKind defaultKind) {
    params["device"].SetString(
        rapidjson::StringRef(device.data(), static_cast<rapidjson::SizeType>(device.size())));
    return RequestResource(params, driverSession, defaultKind);
}

void requireChassis(const RequestResource& resource,
                    const std::shared_ptr<SessionContext>& session) {
    if (!isDeviceOfCategory(resource, session, chassisCategory)) {
        throw nQITRMCSHAREDCMN100::BasicError(qierr::codes::notChassis, QITRMC_HERE);
    }
}

std::vector<std::string> modulesOf(const RequestResource& chassis,
                                   const std::shared_ptr<SessionContext>& session) {
    return SessionProperty(session, "Dev.Modules", chassis).getStringArray();
}

std::uint32_t slotOf(const std::string& module, ScratchParams& scratch,
                     const std::shared_ptr<SessionContext>& session) {
    const RequestResource resource =
        scratch.resourceFor(module, session->driverSession, ResourceKind::Device);
    return SessionProperty(session, "Dev.SlotNum", resource).getUInt32();
}

}  // namespace nQITRMCWEBSVC100
