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
// Relies on a request that passed its schema. Failures are thrown: BasicError invalidResourceName
// with the name that is unknown to the driver, cannot be parsed or holds a NUL.
class RequestResource {
  public:
    // Reads the request's members only.
    explicit RequestResource(const JsonValue& params);

    // Reads the members and has the driver confirm each name; without any, takes the session's own
    // default resources of `defaultKind`.
    RequestResource(const JsonValue& params, nQITRMCAPI100_Session driverSession,
                    ResourceKind defaultKind);

    // As above, with the default kind of the session.
    RequestResource(const JsonValue& params, const SessionContext& session);

    virtual ~RequestResource() = default;

    ResourceKind kind() const { return resourceKind; }
    const std::vector<std::string>& names() const { return resourceNames; }
    // The names as the one text that driver calls take.
    std::string joinedNames() const;

  private:
    void readNames(const JsonValue& value);
    void validateResourceNames(nQITRMCAPI100_Session driverSession) const;
    void applyDefault(ResourceKind defaultKind);

    ResourceKind resourceKind = ResourceKind::None;
    std::vector<std::string> resourceNames;
};

}  // namespace nQITRMCWEBSVC100
