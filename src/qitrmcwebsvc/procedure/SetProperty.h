#pragma once

#include "qitrmcwebsvc/procedure/Procedure.h"

namespace nQITRMCWEBSVC100 {

// Writes a property, which takes effect with a commit. An array of one element may stand for a
// scalar. Throws BasicError -250819 for a value that is not of the property's type. Result:
// data_type.
class SetProperty : public SessionProcedure {
  public:
    using SessionProcedure::SessionProcedure;

  private:
    void run(const JsonValue& params, const std::shared_ptr<SessionContext>& session,
             SingleResponse& response) override;
};

}  // namespace nQITRMCWEBSVC100
