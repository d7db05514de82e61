#include "qitrmcwebsvc/procedure/Procedure.h"

#include <utility>

namespace nQITRMCWEBSVC100 {

Procedure::Procedure(std::shared_ptr<ISessionManager> manager,
                     std::shared_ptr<ISchemaValidator> validator)
    : sessionManager(std::move(manager)), schemaValidator(std::move(validator)) {}

void Procedure::execute(const SingleRequest& request, SingleResponse& response) {
    schemaValidator->validate(request);
    run(request.getParams(), response);
}

std::shared_ptr<SessionContext> Procedure::sessionOf(const JsonValue& params) const {
    return sessionManager->getSessionContext(sessionIdOf(params));
}

}  // namespace nQITRMCWEBSVC100
