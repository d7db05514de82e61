#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "qitrmcwebsvc/ResourceKind.h"
#include "qitrmcwebsvc/SessionContext.h"

namespace nQITRMCWEBSVC100 {

// The open sessions of the service, by the id that clients use.
//
// access: 1 read only, 3 read and write. reservationTimeout: seconds to wait for a device that
// another session holds. Any number of threads may call these functions. The calls are serialised,
// including their driver calls, so a reservation that waits blocks every other call. Throws
// BasicError unknownSession for an unknown id and tooManySessions if no session with resources can
// be added; qierr::Exception with the driver's status if a driver call fails; InternalError
// otherwise.
class ISessionManager {
  public:
    virtual ~ISessionManager() = default;

    // Opens a session without resources and returns its id.
    virtual std::string createSession() = 0;

    // Opens a session on resources, reserves the devices that they belong to, and returns its id.
    // With forceReserve, first closes the sessions of this service that hold one of those devices.
    virtual std::string createSession(ResourceKind kind, const std::vector<std::string>& names,
                                      std::int32_t access, const std::string& reservationGroup,
                                      double reservationTimeout, bool forceReserve) = 0;

    // Finds a session.
    virtual std::shared_ptr<SessionContext> getSessionContext(const std::string& sessionId) = 0;

    // Closes a session. The session stays open if the driver call fails.
    virtual void closeSession(const std::string& sessionId) = 0;

    // Reserves devices for an open session.
    virtual void reserveDevices(const std::string& sessionId, const std::vector<std::string>& names,
                                std::int32_t access, const std::string& reservationGroup,
                                double reservationTimeout) = 0;

    // Releases devices. From then on the session counts as holding no devices, even if it holds
    // others.
    virtual void unreserveDevices(const std::string& sessionId,
                                  const std::vector<std::string>& names) = 0;
};

}  // namespace nQITRMCWEBSVC100
