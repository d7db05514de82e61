#pragma once

#include <set>
#include <vector>

#include "Api.h"
#include "model/Chassis.h"
#include "sessions/HandleTable.h"
#include "state/LastingState.h"

namespace simulator {

struct Session {
    nQITRMCAPI100_Session handle = 0;
    // Until the session has its devices, other calls must not use its handle.
    bool opening = true;
    // The resources that the session was opened on, and the devices that these belong to.
    std::vector<Device*> defaultDevices;
    std::vector<Resource*> defaultPhysChans;
    std::vector<Resource*> defaultNvmemAreas;
    std::vector<Device*> connectedDevices;
    PropertyStore properties;
    // The devices to which this session wrote something that needs a commit, and maybe others.
    std::set<Device*> writtenDevices;
};

// The open sessions. A reference to a session is valid until the session is closed.
class Sessions {
  public:
    // firstProperties: those of a new session.
    Sessions(nQITRMCAPI100_Session firstHandle, const PropertyStore& firstProperties,
             LastingState& lasting)
        : table(firstHandle), firstProperties(firstProperties), lasting(lasting) {}

    // Creates a session with the next free handle. Refuses with stateNotWritten when the handle
    // could be used again after a restart.
    Session& make();
    // Refuses with unknownSession when the handle is unknown or its session is still opening.
    Session& get(nQITRMCAPI100_Session handle);
    // Returns null when the handle is unknown.
    Session* find(nQITRMCAPI100_Session handle) { return table.find(handle); }
    // Calls visit(Session&) for all sessions, including those that are still opening.
    template <typename Visit>
    void forEach(Visit visit) {
        table.forEach(visit);
    }
    template <typename Visit>
    void forEach(Visit visit) const {
        table.forEach(visit);
    }
    void remove(nQITRMCAPI100_Session handle) noexcept { table.remove(handle); }

    // Including those that are still opening.
    std::uint32_t size() const { return table.size(); }

  private:
    HandleTable<Session> table;
    const PropertyStore& firstProperties;
    LastingState& lasting;
};

}  // namespace simulator
