#pragma once

#include <memory>

#include "qitrmcwebsvc/IProcedure.h"
#include "qitrmcwebsvc/ISchemaValidator.h"
#include "qitrmcwebsvc/ISessionManager.h"
#include "qitrmcwebsvc/procedure/parameters.h"

namespace nQITRMCWEBSVC100 {

// The frame of every procedure: the request's schema first, the work after it. A procedure has no
// state beside the two shared owners and catches no exception.
class Procedure : public IProcedure {
  public:
    Procedure(std::shared_ptr<ISessionManager> manager,
              std::shared_ptr<ISchemaValidator> validator);

    void execute(const SingleRequest& request, SingleResponse& response) final;

  protected:
    // The session that `params` names, to be held to the end of the request; its driver session may
    // be closed meanwhile. Throws BasicError unknownSession.
    std::shared_ptr<SessionContext> sessionOf(const JsonValue& params) const;

    const std::shared_ptr<ISessionManager> sessionManager;
    const std::shared_ptr<ISchemaValidator> schemaValidator;

  private:
    // Does the work with params that conform to the schema, and sets the result last.
    virtual void run(const JsonValue& params, SingleResponse& response) const = 0;
};

}  // namespace nQITRMCWEBSVC100
