#pragma once

#include "qitrmcwebsvc/procedure/Procedure.h"

namespace nQITRMCWEBSVC100 {

// Releases devices that the session has reserved. Result: an empty object.
class UnreserveDevices : public SessionProcedure {
  public:
    using SessionProcedure::SessionProcedure;

  private:
    void run(const JsonValue& params, const std::shared_ptr<SessionContext>& session,
             SingleResponse& response) override;
};

}  // namespace nQITRMCWEBSVC100
