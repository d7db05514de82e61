#include "qitrmcwebsvc/SessionManager.h"

#include <algorithm>
#include <iterator>
#include <utility>

#include "qitrmcsharedcmn/Exceptions.h"
#include "qitrmcsharedcmn/parseUtilities.h"
#include "qitrmcwebsvc/DriverOwners.h"
#include "qitrmcwebsvc/callDriver.h"

namespace nQITRMCWEBSVC100 {

using namespace nQITRMCSHAREDCMN100;

namespace {

constexpr std::size_t maxSessionsWithResources = 100;
constexpr double openTimeout = 60.0;

using OpenSession = void (*)(nQITRMCAPI100_Session*, const char*, double, std::int32_t, const char*,
                             double, qierr_Status*);

constexpr std::pair<ResourceKind, OpenSession> openFunctions[] = {
    {ResourceKind::Device, nQITRMCAPI100_initializeSessionWithDevices},
    {ResourceKind::PhysicalChannel, nQITRMCAPI100_initializeSessionWithPhysChans},
    {ResourceKind::NvmemArea, nQITRMCAPI100_initializeSessionWithNvmemAreas},
};

OpenSession openFunction(ResourceKind kind) {
    for (const auto& [candidate, function] : openFunctions) {
        if (candidate == kind) {
            return function;
        }
    }
    throw InternalError("Unsupported resource type", QITRMC_HERE);
}

// For the id, the handle is converted to a signed number and sign-extended to 64 bits.
std::string sessionIdOf(nQITRMCAPI100_Session session) {
    const auto widened = static_cast<std::int64_t>(static_cast<std::int32_t>(session));
    return "_session" + std::to_string(static_cast<unsigned long long>(widened));
}

// The devices that resources of a kind belong to. The name of a channel or area begins with the
// name of its device and a slash.
std::set<std::string> devicesOf(ResourceKind kind, const std::vector<std::string>& names) {
    std::set<std::string> devices;
    for (const std::string& name : names) {
        if (kind == ResourceKind::Device) {
            devices.insert(name);
        } else if (kind == ResourceKind::PhysicalChannel || kind == ResourceKind::NvmemArea) {
            devices.insert(name.substr(0, name.find('/')));
        }
    }
    return devices;
}

// If the driver cannot list a session's devices, the session counts as holding none.
bool sessionHoldsAnyDevice(nQITRMCAPI100_Session session, const std::set<std::string>& devices) {
    qierr::Status status;
    DriverStringArray reserved;
    nQITRMCAPI100_getSessionPropertyStringArray(session, "Session.ReservedDevices",
                                                reserved.outArray(), reserved.outCount(), &status);
    return status.code >= 0 && std::any_of(reserved.begin(), reserved.end(),
                                           [&](const char* name) { return devices.count(name); });
}

// Closes a newly opened session unless it has been added to the table.
class OpenedSession {
  public:
    explicit OpenedSession(nQITRMCAPI100_Session opened) : session(opened) {}
    ~OpenedSession() {
        if (session != 0) {
            qierr::Status status;
            nQITRMCAPI100_closeSession(session, &status);
        }
    }
    OpenedSession(const OpenedSession&) = delete;
    OpenedSession& operator=(const OpenedSession&) = delete;

    void keep() { session = 0; }

  private:
    nQITRMCAPI100_Session session;
};

}  // namespace

SessionManager::~SessionManager() {
    for (const auto& [id, context] : sessions) {
        qierr::Status status;
        nQITRMCAPI100_closeSession(context->driverSession, &status);
    }
}

std::string SessionManager::createSession() {
    std::lock_guard<std::recursive_mutex> hold(mutex);
    SessionContext context;
    callDriver(nQITRMCAPI100_initializeSessionWithoutResources, &context.driverSession);
    return addSession(context);
}

std::string SessionManager::createSession(ResourceKind kind, const std::vector<std::string>& names,
                                          std::int32_t access, const std::string& reservationGroup,
                                          double reservationTimeout, bool forceReserve) {
    if (kind == ResourceKind::None) {
        throw InternalError("Unsupported resource type", QITRMC_HERE);
    }
    std::lock_guard<std::recursive_mutex> hold(mutex);
    const DeviceSet devices = devicesOf(kind, names);
    if (forceReserve) {
        closeSessionsReserving(devices);
    }
    if (sessions.size() == maxSessionsWithResources) {
        throw BasicError(qierr::codes::tooManySessions, QITRMC_HERE);
    }
    const std::string joinedNames = compressNames(names, NameKind::Path);
    const OpenSession open = openFunction(kind);
    SessionContext context{kind, access, 0};
    {
        ThrowingStatus status;
        open(&context.driverSession, joinedNames.c_str(), openTimeout, access,
             reservationGroup.c_str(), reservationTimeout, &status);
        reportReservingSessions(devices, &status);
    }
    if (context.driverSession == 0) {
        throw InternalError("Fail to initialize session.", QITRMC_HERE);
    }
    return addSession(context);
}

std::shared_ptr<SessionContext> SessionManager::getSessionContext(const std::string& sessionId) {
    std::lock_guard<std::recursive_mutex> hold(mutex);
    const auto found = sessions.find(sessionId);
    if (found == sessions.end()) {
        BasicError error(qierr::codes::unknownSession, QITRMC_HERE);
        addUsageString(error.details(), "kUsageTypeSessionId", sessionId.c_str());
        throw error;
    }
    return found->second;
}

void SessionManager::closeSession(const std::string& sessionId) {
    std::lock_guard<std::recursive_mutex> hold(mutex);
    callDriver(nQITRMCAPI100_closeSession, getSessionContext(sessionId)->driverSession);
    sessions.erase(sessionId);
}

void SessionManager::reserveDevices(const std::string& sessionId,
                                    const std::vector<std::string>& names, std::int32_t access,
                                    const std::string& reservationGroup,
                                    double reservationTimeout) {
    std::lock_guard<std::recursive_mutex> hold(mutex);
    const std::shared_ptr<SessionContext> context = getSessionContext(sessionId);
    const DeviceSet devices(names.begin(), names.end());
    const std::string joinedNames = compressNames(names, NameKind::Path);
    {
        ThrowingStatus status;
        nQITRMCAPI100_reserveDevices(context->driverSession, joinedNames.c_str(), access,
                                     reservationGroup.c_str(), reservationTimeout, &status);
        reportReservingSessions(devices, &status);
    }
    context->access = access;
}

void SessionManager::unreserveDevices(const std::string& sessionId,
                                      const std::vector<std::string>& names) {
    std::lock_guard<std::recursive_mutex> hold(mutex);
    const std::shared_ptr<SessionContext> context = getSessionContext(sessionId);
    const std::string joinedNames = compressNames(names, NameKind::Path);
    callDriver(nQITRMCAPI100_unreserveDevices, context->driverSession, joinedNames.c_str());
    context->access = 0;
}

// If the driver returns a handle that is already in the table, the existing entry is kept.
std::string SessionManager::addSession(const SessionContext& context) {
    OpenedSession opened(context.driverSession);
    std::string id = sessionIdOf(context.driverSession);
    sessions.emplace(id, std::make_shared<SessionContext>(context));
    opened.keep();
    return id;
}

// On failure, the sessions that were already closed stay closed, and the others stay open.
void SessionManager::closeSessionsReserving(const DeviceSet& devices) {
    if (devices.empty()) {
        return;
    }
    for (auto entry = sessions.begin(); entry != sessions.end();) {
        const nQITRMCAPI100_Session session = entry->second->driverSession;
        const auto next = std::next(entry);
        if (sessionHoldsAnyDevice(session, devices)) {
            callDriver(nQITRMCAPI100_closeSession, session);
            sessions.erase(entry);
        }
        entry = next;
    }
}

// Sessions with read-only access are not included.
std::vector<std::string> SessionManager::findSessionsReserving(const DeviceSet& devices) {
    std::lock_guard<std::recursive_mutex> hold(mutex);
    std::vector<std::string> ids;
    if (devices.empty()) {
        return ids;
    }
    for (const auto& [id, context] : sessions) {
        if (sessionHoldsAnyDevice(context->driverSession, devices) &&
            (context->access == 3 || context->access == 2)) {
            ids.push_back(id);
        }
    }
    return ids;
}

void SessionManager::reportReservingSessions(const DeviceSet& devices, qierr_Status* status) {
    if (status->code != qierr::codes::deviceReserved) {
        return;
    }
    const std::vector<std::string> ids = findSessionsReserving(devices);
    if (!ids.empty()) {
        addUsageStringArray(qierr_orderedData(translatorName, status),
                            "kUsageTypeReservedBySessions", ids);
    }
}

}  // namespace nQITRMCWEBSVC100
