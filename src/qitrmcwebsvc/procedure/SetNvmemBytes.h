#pragma once

#include "qitrmcwebsvc/procedure/Procedure.h"

namespace nQITRMCWEBSVC100 {

// Writes bytes to an NVMEM area; they last only after a commit. Result: next_address, which is the
// address plus 1 whatever the count of bytes.
class SetNvmemBytes : public SessionProcedure {
  public:
    using SessionProcedure::SessionProcedure;

  private:
    void run(const JsonValue& params, const std::shared_ptr<SessionContext>& session,
             SingleResponse& response) override;
};

}  // namespace nQITRMCWEBSVC100
