#pragma once

#include "qitrmcwebsvc/procedure/Procedure.h"

namespace nQITRMCWEBSVC100 {

// Reads bytes of an NVMEM area. Result: data, and next_address, which is the address plus 1
// whatever the count of bytes.
class GetNvmemBytes : public SessionProcedure {
  public:
    using SessionProcedure::SessionProcedure;

  private:
    void run(const JsonValue& params, const std::shared_ptr<SessionContext>& session,
             SingleResponse& response) override;
};

}  // namespace nQITRMCWEBSVC100
