#include "qitrmcwebsvc/procedure/procedures.h"

namespace nQITRMCWEBSVC100 {

// Closes a session. Result: an empty object.
void CloseSession::run(const JsonValue& params, SingleResponse& response) const {
    sessionManager->closeSession(sessionIdOf(params));
    response.setEmptyResult();
}

}  // namespace nQITRMCWEBSVC100
