// Folder procedure: the classes that execute the JSON-RPC methods.
#pragma once

#include <memory>

#include "qitrmcwebsvc/IProcedure.h"
#include "qitrmcwebsvc/ISchemaValidator.h"
#include "qitrmcwebsvc/ISessionManager.h"
#include "qitrmcwebsvc/procedure/parameters.h"

namespace nQITRMCWEBSVC100 {

// Base class of all procedures: validates the request against its schema, then executes it. A
// procedure has no state besides these two shared objects and catches no exceptions.
class Procedure : public IProcedure {
  public:
    Procedure(std::shared_ptr<ISessionManager> manager,
              std::shared_ptr<ISchemaValidator> validator);

    void execute(const SingleRequest& request, SingleResponse& response) final;

  protected:
    // The session that `params` names, to be kept until the end of the request; its driver session
    // may be closed in the meantime. Throws BasicError unknownSession.
    std::shared_ptr<SessionContext> sessionOf(const JsonValue& params) const;

    const std::shared_ptr<ISessionManager> sessionManager;
    const std::shared_ptr<ISchemaValidator> schemaValidator;

  private:
    // Executes the method with params that conform to the schema, and sets the result last.
    virtual void run(const JsonValue& params, SingleResponse& response) const = 0;
};

}  // namespace nQITRMCWEBSVC100
