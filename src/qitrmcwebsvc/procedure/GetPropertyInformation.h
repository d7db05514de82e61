#pragma once

#include "qitrmcwebsvc/procedure/Procedure.h"

namespace nQITRMCWEBSVC100 {

// Tells what a property is. Result: description, document, max_value, min_value and unit where they
// are not empty; data_type, access, driver_defined, pending_changes; for an enumerated property
// enum.
class GetPropertyInformation : public SessionProcedure {
  public:
    using SessionProcedure::SessionProcedure;

  private:
    void run(const JsonValue& params, const std::shared_ptr<SessionContext>& session,
             SingleResponse& response) override;
};

}  // namespace nQITRMCWEBSVC100
