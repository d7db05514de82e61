#include <utility>

#include "entries/Entry.h"

namespace simulator {

namespace {

struct ReservationTerms {
    std::int32_t access;
    const char* group;
    double timeout;
};

Holding holding(nQITRMCAPI100_Session session, const ReservationTerms& terms) {
    if (terms.access != readOnlyAccess && terms.access != readWriteAccess) {
        throw Refusal(code::invalidAccess).usage(tag::requestedValue, std::to_string(terms.access));
    }
    return Holding{session, terms.access, std::string(required(terms.group, "reservationGroup"))};
}

// Removes a session again unless its opening comes to an end.
class Opening {
  public:
    explicit Opening(Sessions& sessions) : sessions(sessions), made(&sessions.make()) {}
    ~Opening() {
        if (made->opening) {
            sessions.remove(made->handle);
        }
    }
    Session& session() { return *made; }

  private:
    Sessions& sessions;
    Session* made;
};

void setDefaults(Session& session, Kind kind, const std::vector<Resource*>& resources) {
    session.defaultDevices = owners(resources);
    if (kind == Kind::PhysChan) {
        session.defaultPhysChans = distinct(resources);
    } else if (kind == Kind::NvmemArea) {
        session.defaultNvmemAreas = distinct(resources);
    }
}

// One of the functions that open a session on resources.
struct Opener {
    const char* function;
    Kind kind;
    // The name of the argument that names the resources.
    const char* argument;
};

void openOn(const Opener& opener, const char* names, double connectTimeout,
            const ReservationTerms& terms, nQITRMCAPI100_Session* handle, qierr_Status* status) {
    clearOutputs(status, handle);
    const auto call = [&] {
        return Call(opener.function)
            .out("session", handle)
            .resources(opener.argument, names)
            .in("timeout", connectTimeout)
            .in("access", terms.access)
            .in("reservationGroup", terms.group)
            .in("reservationTimeout", terms.timeout);
    };
    withSimulator(status, call, [&](Simulator& simulator, WriteLock& lock) {
        Opening opening(simulator.sessions);
        Session& session = opening.session();
        const auto resources =
            simulator.resolver(session).resources(opener.kind, required(names, "resources"));
        expectSome(resources);
        setDefaults(session, opener.kind, resources);
        const double timeout = checkedTimeout(terms.timeout);
        simulator.reservations.reserve(session.defaultDevices, holding(session.handle, terms),
                                       timeout, lock);
        session.opening = false;
        *handle = session.handle;
    });
}

}  // namespace

}  // namespace simulator

using namespace simulator;

void nQITRMCAPI100_initializeSessionWithoutResources(nQITRMCAPI100_Session* session,
                                                     qierr_Status* status) {
    clearOutputs(status, session);
    const auto call = [&, function = __func__] { return Call(function).out("session", session); };
    withSimulator(status, call, [&](Simulator& simulator, auto&) {
        Session& made = simulator.sessions.make();
        made.opening = false;
        *session = made.handle;
    });
}

void nQITRMCAPI100_initializeSessionWithDevices(nQITRMCAPI100_Session* session, const char* devices,
                                                double timeout, std::int32_t access,
                                                const char* reservationGroup,
                                                double reservationTimeout, qierr_Status* status) {
    openOn({__func__, Kind::Device, "devices"}, devices, timeout,
           {access, reservationGroup, reservationTimeout}, session, status);
}

void nQITRMCAPI100_initializeSessionWithPhysChans(nQITRMCAPI100_Session* session,
                                                  const char* physicalChannels, double timeout,
                                                  std::int32_t access, const char* reservationGroup,
                                                  double reservationTimeout, qierr_Status* status) {
    openOn({__func__, Kind::PhysChan, "physicalChannels"}, physicalChannels, timeout,
           {access, reservationGroup, reservationTimeout}, session, status);
}

void nQITRMCAPI100_initializeSessionWithNvmemAreas(
    nQITRMCAPI100_Session* session, const char* nvmemAreas, double timeout, std::int32_t access,
    const char* reservationGroup, double reservationTimeout, qierr_Status* status) {
    openOn({__func__, Kind::NvmemArea, "nvmemAreas"}, nvmemAreas, timeout,
           {access, reservationGroup, reservationTimeout}, session, status);
}

void nQITRMCAPI100_closeSession(nQITRMCAPI100_Session session, qierr_Status* status) {
    const auto call = [&, function = __func__] { return Call(function).session(session); };
    withSimulator(status, call, [&](Simulator& simulator, auto&) {
        simulator.sessions.get(session);
        simulator.close(session);
    });
}

void nQITRMCAPI100_abortSession(nQITRMCAPI100_Session session, qierr_Status* status) {
    const auto call = [&, function = __func__] { return Call(function).session(session); };
    withSimulator(status, call, [&](Simulator& simulator, auto&) {
        simulator.sessions.get(session);
        simulator.waits.endAll(session, Wait::End::Aborted);
    });
}

void nQITRMCAPI100_reserveDevices(nQITRMCAPI100_Session session, const char* devices,
                                  std::int32_t access, const char* reservationGroup,
                                  double reservationTimeout, qierr_Status* status) {
    const auto call = [&, function = __func__] {
        return Call(function)
            .session(session)
            .resources("devices", devices)
            .in("access", access)
            .in("reservationGroup", reservationGroup)
            .in("reservationTimeout", reservationTimeout);
    };
    withSimulator(status, call, [&](Simulator& simulator, WriteLock& lock) {
        const Session& holder = simulator.sessions.get(session);
        const auto wanted = simulator.resolver(holder).devices(required(devices, "devices"));
        const double timeout = checkedTimeout(reservationTimeout);
        simulator.reservations.reserve(
            wanted, holding(session, {access, reservationGroup, reservationTimeout}), timeout,
            lock);
    });
}

void nQITRMCAPI100_unreserveDevices(nQITRMCAPI100_Session session, const char* devices,
                                    qierr_Status* status) {
    const auto call = [&, function = __func__] {
        return Call(function).session(session).resources("devices", devices);
    };
    withSimulator(status, call, [&](Simulator& simulator, auto&) {
        const Session& holder = simulator.sessions.get(session);
        std::vector<std::string> notHeld;
        for (const Device* device :
             simulator.resolver(holder).devices(required(devices, "devices"))) {
            if (!simulator.reservations.release(session, *device)) {
                notHeld.push_back(device->name);
            }
        }
        if (!notHeld.empty()) {
            throw Refusal(code::nothingToRelease).usage(tag::devices, notHeld);
        }
    });
}
