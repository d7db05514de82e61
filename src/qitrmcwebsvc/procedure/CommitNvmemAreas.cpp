#include <qitrmcapi.h>

#include "qitrmcwebsvc/RequestResource.h"
#include "qitrmcwebsvc/callDriver.h"
#include "qitrmcwebsvc/procedure/procedures.h"

namespace nQITRMCWEBSVC100 {

// Makes the pending writes of NVMEM areas, or of all areas of devices, permanent. Result: an empty
// object.
void CommitNvmemAreas::run(const JsonValue& params, SingleResponse& response) const {
    const std::shared_ptr<SessionContext> session = sessionOf(params);
    const RequestResource resource(params, *session);
    callDriver(nQITRMCAPI100_commitNvmemGeneric, session->driverSession,
               resource.joinedNames().c_str());
    response.setEmptyResult();
}

}  // namespace nQITRMCWEBSVC100
