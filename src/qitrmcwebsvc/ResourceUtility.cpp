#include "qitrmcwebsvc/ResourceUtility.h"

#include "qitrmcwebsvc/SessionProperty.h"
#include "qitrmcwebsvc/invalidParams.h"

namespace nQITRMCWEBSVC100 {

bool isDeviceOfCategory(const RequestResource& resource,
                        const std::shared_ptr<SessionContext>& session, std::int32_t category) {
    if (resource.kind() != ResourceKind::Device || resource.names().size() != 1) {
        throwInvalidParams("OneOfDeviceSupported", QITRMC_HERE);
    }
    return SessionProperty(session, "Dev.ProductCategory", resource).getInt32() == category;
}

}  // namespace nQITRMCWEBSVC100
