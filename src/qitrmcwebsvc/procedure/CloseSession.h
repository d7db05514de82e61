#pragma once

#include "qitrmcwebsvc/procedure/Procedure.h"

namespace nQITRMCWEBSVC100 {

// Ends a session. Result: an empty object.
class CloseSession : public Procedure {
  public:
    using Procedure::Procedure;

  private:
    void run(const JsonValue& params, SingleResponse& response) override;
};

}  // namespace nQITRMCWEBSVC100
