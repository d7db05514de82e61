#include "qitrmcwebsvc/RequestResource.h"
#include "qitrmcwebsvc/procedure/procedures.h"

namespace nQITRMCWEBSVC100 {

// Reserves devices for the session. Result: an empty object.
void ReserveDevices::run(const JsonValue& params, SingleResponse& response) const {
    const std::shared_ptr<SessionContext> session = sessionOf(params);
    const RequestResource resource(params, session->driverSession, ResourceKind::Device);
    const ReservationParams reservation = reservationParams(params);
    sessionManager->reserveDevices(sessionIdOf(params), resource.names(), reservation.access,
                                   reservation.group, reservation.timeout);
    response.setEmptyResult();
}

}  // namespace nQITRMCWEBSVC100
