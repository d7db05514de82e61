#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "qitrmcwebsvc/ResourceKind.h"
#include "qitrmcwebsvc/SessionContext.h"

namespace nQITRMCWEBSVC100 {

// The open sessions of the service, by the id that clients carry.
//
// access: 1 read only, 3 read and write. reservationTimeout: seconds to wait for a device that
// another session holds. Any number of threads may call; each call runs alone, the driver's part of
// it included, so a reservation that waits holds up every other call. Failures are thrown:
// BasicError unknownSession for an unknown id, tooManySessions when no session with resources can
// be added; qierr::Exception with the driver's status when the driver refuses; InternalError
// otherwise.
class ISessionManager {
  public:
    virtual ~ISessionManager() = default;

    // Opens a session without resources and returns its id.
    virtual std::string createSession() = 0;

    // Opens a session on resources, reserving the devices they belong to, and returns its id.
    // forceReserve closes the sessions of this service that hold one of those devices, first.
    virtual std::string createSession(ResourceKind kind, const std::vector<std::string>& names,
                                      std::int32_t access, const std::string& reservationGroup,
                                      double reservationTimeout, bool forceReserve) = 0;

    // Looks a session up.
    virtual std::shared_ptr<SessionContext> getSessionContext(const std::string& sessionId) = 0;

    // Closes a session. It stays open when the driver refuses.
    virtual void closeSession(const std::string& sessionId) = 0;

    // Reserves devices for an open session.
    virtual void reserveDevices(const std::string& sessionId, const std::vector<std::string>& names,
                                std::int32_t access, const std::string& reservationGroup,
                                double reservationTimeout) = 0;

    // Releases devices. The session counts as holding none from then on, even if it holds others.
    virtual void unreserveDevices(const std::string& sessionId,
                                  const std::vector<std::string>& names) = 0;
};

}  // namespace nQITRMCWEBSVC100
