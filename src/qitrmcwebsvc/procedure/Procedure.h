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
    // Does the work with params that conform to the schema, and sets the result last.
    virtual void run(const JsonValue& params, SingleResponse& response) = 0;

    const std::shared_ptr<ISessionManager> sessionManager;
    const std::shared_ptr<ISchemaValidator> schemaValidator;
};

// The frame of the procedures that act on an open session.
class SessionProcedure : public Procedure {
  public:
    using Procedure::Procedure;

  protected:
    // `session` is held to the end of the request; its driver session may be closed meanwhile.
    virtual void run(const JsonValue& params, const std::shared_ptr<SessionContext>& session,
                     SingleResponse& response) = 0;

  private:
    void run(const JsonValue& params, SingleResponse& response) final;
};

}  // namespace nQITRMCWEBSVC100
