#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "qitrmcwebsvc/Json.h"
#include "qitrmcwebsvc/RequestResource.h"
#include "qitrmcwebsvc/SessionContext.h"

namespace nQITRMCWEBSVC100 {

// Functions for the procedures on a chassis. Failures of the driver are thrown as qierr::Exception.

// Params with only the member "device", to read properties of a device that the request does not
// name. The device's name is expanded and checked like one from a client.
class ScratchParams {
  public:
    explicit ScratchParams(JsonAllocator& allocator);

    RequestResource resourceFor(const std::string& device, nQITRMCAPI100_Session driverSession,
                                ResourceKind defaultKind);

  private:
    JsonValue params;
};

// Throws BasicError invalidParams unless the resources are one device, and notChassis unless that
// device is a chassis.
void requireChassis(const RequestResource& resource,
                    const std::shared_ptr<SessionContext>& session);

// The names of a chassis's modules, in the driver's order.
std::vector<std::string> modulesOf(const RequestResource& chassis,
                                   const std::shared_ptr<SessionContext>& session);

// The slot of a module, counted from 1.
std::uint32_t slotOf(const std::string& module, ScratchParams& scratch,
                     const std::shared_ptr<SessionContext>& session);

}  // namespace nQITRMCWEBSVC100
