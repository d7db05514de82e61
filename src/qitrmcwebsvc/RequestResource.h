#pragma once

#include <qitrmcapi.h>

#include <string>
#include <vector>

#include "qitrmcwebsvc/Json.h"
#include "qitrmcwebsvc/ResourceKind.h"
#include "qitrmcwebsvc/SessionContext.h"

namespace nQITRMCWEBSVC100 {

// The resources that a request names: their kind and their expanded names, in request order.
//
// Requires params that conform to their schema. Throws BasicError invalidResourceName, with the
// name as a detail, for a name that the driver does not list, that cannot be parsed or that
// contains a NUL.
class RequestResource {
  public:
    // Reads the names from the params without checking them against the driver's lists.
    explicit RequestResource(const JsonValue& params);

    // Reads the names from the params and checks that the driver lists them. If the params name no
    // resources, uses the session's default resources of `defaultKind`.
    // Inline, so that the exception for an unknown name passes one function less.
    RequestResource(const JsonValue& params, nQITRMCAPI100_Session driverSession,
                    ResourceKind defaultKind)
        : RequestResource(params) {
        confirm(driverSession, defaultKind);
    }

    // The same with the default kind of the session.
    RequestResource(const JsonValue& params, const SessionContext& session)
        : RequestResource(params, session.driverSession, session.defaultResourceKind) {}

    virtual ~RequestResource() = default;

    ResourceKind kind() const { return resourceKind; }
    const std::vector<std::string>& names() const { return resourceNames; }
    // The names as one comma-separated text, as driver functions expect them.
    std::string joinedNames() const;

  private:
    void readNames(const JsonValue& value);
    // The first name that the driver does not list; null if there is none.
    const std::string* firstUnknownName(nQITRMCAPI100_Session driverSession) const;
    void confirm(nQITRMCAPI100_Session driverSession, ResourceKind defaultKind);
    void applyDefault(ResourceKind defaultKind);

    ResourceKind resourceKind = ResourceKind::None;
    std::vector<std::string> resourceNames;
};

}  // namespace nQITRMCWEBSVC100
