#pragma once

#include "qitrmcwebsvc/procedure/Procedure.h"

namespace nQITRMCWEBSVC100 {

// Writes one register of a device. Throws BasicError -250860 for data with bits above the
// register's size. Result: next_address, which is the address plus 1 whatever the size.
class WriteRegister : public SessionProcedure {
  public:
    using SessionProcedure::SessionProcedure;

  private:
    void run(const JsonValue& params, const std::shared_ptr<SessionContext>& session,
             SingleResponse& response) override;
};

}  // namespace nQITRMCWEBSVC100
