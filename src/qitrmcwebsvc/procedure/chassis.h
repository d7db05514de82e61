#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "qitrmcwebsvc/Json.h"
#include "qitrmcwebsvc/RequestResource.h"
#include "qitrmcwebsvc/SessionContext.h"

namespace nQITRMCWEBSVC100 {

// What the procedures on a chassis share. Driver refusals are thrown as qierr::Exception; no
// property stays open.

// Params with the one member "device", to ask about a device that no request names: its name is
// expanded and checked as though a client had sent it.
class ScratchParams {
  public:
    explicit ScratchParams(JsonPool& pool);

    RequestResource resourceFor(const std::string& device, nQITRMCAPI100_Session driverSession,
                                ResourceKind defaultKind);

  private:
    JsonValue params;
};

// Throws BasicError invalidParams unless the resources are one device, and notChassis unless it is
// a chassis.
void requireChassis(const RequestResource& resource,
                    const std::shared_ptr<SessionContext>& session);

// The names of a chassis's modules, in the driver's order.
std::vector<std::string> modulesOf(const RequestResource& chassis,
                                   const std::shared_ptr<SessionContext>& session);

// The slot of a module, counted from 1.
std::uint32_t slotOf(const std::string& module, ScratchParams& scratch,
                     const std::shared_ptr<SessionContext>& session);

}  // namespace nQITRMCWEBSVC100
