#pragma once

#include "qitrmcwebsvc/procedure/Procedure.h"

namespace nQITRMCWEBSVC100 {

// Lists the properties of a kind of resource, sorted, and those that one resource defines for
// itself, in the driver's order. The latter are left out for NVMEM areas, which define none, and
// when the driver cannot list them. Result: static_properties, dynamic_properties.
class GetDevicePropertyList : public SessionProcedure {
  public:
    using SessionProcedure::SessionProcedure;

  private:
    void run(const JsonValue& params, const std::shared_ptr<SessionContext>& session,
             SingleResponse& response) override;
};

}  // namespace nQITRMCWEBSVC100
