#include "qitrmcwebsvc/procedure/ExecuteCommand.h"

#include <qitrmcapi.h>

#include "qitrmcwebsvc/RequestResource.h"
#include "qitrmcwebsvc/callDriver.h"

namespace nQITRMCWEBSVC100 {
namespace {

constexpr double defaultTimeout = 10.0;

}  // namespace

void ExecuteCommand::run(const JsonValue& params, const std::shared_ptr<SessionContext>& session,
                         SingleResponse& response) {
    const RequestResource resource(params, session->driverSession, session->defaultResourceKind);
    const std::string command = textParam(params, "command");
    const double timeout = doubleParam(params, "timeout", defaultTimeout);
    callDriver(nQITRMCAPI100_executeGenericCommand, session->driverSession,
               resource.joinedNames().c_str(), command.c_str(), timeout);
    response.setEmptyResult();
}

}  // namespace nQITRMCWEBSVC100
