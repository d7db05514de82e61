#pragma once

#include <map>
#include <mutex>
#include <set>

#include "qitrmcwebsvc/ISessionManager.h"

namespace nQITRMCWEBSVC100 {

// The one place that opens and closes driver sessions. Sessions have no expiry: one whose client is
// gone stays until it is closed by id, displaced, or the manager ends and closes all that are left.
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

    // All of these are called with the mutex held.
    std::string addSession(const SessionContext& context);
    void closeSessionsReserving(const DeviceSet& devices);
    std::vector<std::string> findSessionsReserving(const DeviceSet& devices);
    void reportReservingSessions(const DeviceSet& devices, qierr_Status* status);

    std::recursive_mutex mutex;
    std::map<std::string, std::shared_ptr<SessionContext>> sessions;
};

}  // namespace nQITRMCWEBSVC100
