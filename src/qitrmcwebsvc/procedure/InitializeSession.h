#pragma once

#include "qitrmcwebsvc/procedure/Procedure.h"

namespace nQITRMCWEBSVC100 {

// Opens a session, with or without resources and their reservation. Result: session_id.
class InitializeSession : public Procedure {
  public:
    using Procedure::Procedure;

  private:
    void run(const JsonValue& params, SingleResponse& response) override;
};

}  // namespace nQITRMCWEBSVC100
