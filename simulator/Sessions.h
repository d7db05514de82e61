#pragma once

#include <map>
#include <string>
#include <string_view>
#include <vector>

#include "Chassis.h"
#include "qitrmcapi.h"

namespace simulator {

struct Session {
    explicit Session(nQITRMCAPI100_Session handle) : handle(handle) {}

    const nQITRMCAPI100_Session handle;
    // Until the session has its devices, nobody else may use its handle.
    bool opening = true;
    // The resources that the session was opened on, and the devices that these belong to.
    std::vector<Device*> defaultDevices;
    std::vector<Resource*> defaultPhysChans;
    std::vector<Resource*> defaultNvmemAreas;
    std::vector<Device*> connectedDevices;
};

// The open sessions. A reference to a session is valid until the session is closed.
class Sessions {
  public:
    explicit Sessions(nQITRMCAPI100_Session firstHandle) : next(firstHandle) {}

    // Makes a session under the next free handle, which is never 0.
    Session& make();
    // Refuses with unknownSession when the handle is dead or its session is still opening.
    Session& get(nQITRMCAPI100_Session handle);
    void remove(nQITRMCAPI100_Session handle) noexcept { table.erase(handle); }

  private:
    std::map<nQITRMCAPI100_Session, Session> table;
    nQITRMCAPI100_Session next;
};

}  // namespace simulator
