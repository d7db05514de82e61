#include <qitrmcapi.h>

#include "qitrmcwebsvc/RequestResource.h"
#include "qitrmcwebsvc/callDriver.h"
#include "qitrmcwebsvc/procedure/procedures.h"

namespace nQITRMCWEBSVC100 {
namespace {

constexpr double defaultTimeout = 10.0;

}  // namespace

// Runs a command on resources. Result: an empty object.
void ExecuteCommand::run(const JsonValue& params, SingleResponse& response) const {
    const std::shared_ptr<SessionContext> session = sessionOf(params);
    const RequestResource resource(params, *session);
    const std::string command = textParam(params, "command");
    const double timeout = doubleParam(params, "timeout", defaultTimeout);
    callDriver(nQITRMCAPI100_executeGenericCommand, session->driverSession,
               resource.joinedNames().c_str(), command.c_str(), timeout);
    response.setEmptyResult();
}

}  // namespace nQITRMCWEBSVC100
