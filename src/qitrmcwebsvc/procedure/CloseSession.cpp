#include "qitrmcwebsvc/procedure/CloseSession.h"

namespace nQITRMCWEBSVC100 {

void CloseSession::run(const JsonValue& params, SingleResponse& response) {
    sessionManager->closeSession(sessionIdOf(params));
    response.setEmptyResult();
}

}  // namespace nQITRMCWEBSVC100
