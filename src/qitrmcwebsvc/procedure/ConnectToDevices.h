#pragma once

#include "qitrmcwebsvc/procedure/Procedure.h"

namespace nQITRMCWEBSVC100 {

// Connects devices of the session, for as long as the driver cares to wait. Result: an empty
// object.
class ConnectToDevices : public SessionProcedure {
  public:
    using SessionProcedure::SessionProcedure;

  private:
    void run(const JsonValue& params, const std::shared_ptr<SessionContext>& session,
             SingleResponse& response) override;
};

}  // namespace nQITRMCWEBSVC100
