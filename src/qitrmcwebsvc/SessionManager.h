#pragma once

#include <map>
#include <mutex>
#include <set>

#include "qitrmcwebsvc/ISessionManager.h"

namespace nQITRMCWEBSVC100 {

// The only class that opens and closes driver sessions. Sessions do not expire: the session of a
// client that has disappeared stays open until it is closed by its id, closed in favour of a
// session with forceReserve, or closed by the manager's destructor.
class SessionManager : public ISessionManager {
  public:
    SessionManager() = default;
    ~SessionManager() override;
    SessionManager(const SessionManager&) = delete;
    SessionManager& operator=(const SessionManager&) = delete;

    std::string createSession() override;
    std::string createSession(ResourceKind kind, const std::vector<std::string>& names,
                              std::int32_t access, const std::string& reservationGroup,
                              double reservationTimeout, bool forceReserve) override;
    std::shared_ptr<SessionContext> getSessionContext(const std::string& sessionId) override;
    void closeSession(const std::string& sessionId) override;
    void reserveDevices(const std::string& sessionId, const std::vector<std::string>& names,
                        std::int32_t access, const std::string& reservationGroup,
                        double reservationTimeout) override;
    void unreserveDevices(const std::string& sessionId,
                          const std::vector<std::string>& names) override;

  private:
    using DeviceSet = std::set<std::string>;

    // The mutex is held when these functions are called.
    std::string addSession(const SessionContext& context);
    void closeSessionsReserving(const DeviceSet& devices);
    std::vector<std::string> findSessionsReserving(const DeviceSet& devices);
    void reportReservingSessions(const DeviceSet& devices, qierr_Status* status);

    std::recursive_mutex mutex;
    std::map<std::string, std::shared_ptr<SessionContext>> sessions;
};

}  // namespace nQITRMCWEBSVC100
