#include "qitrmcwebsvc/procedure/ReserveDevices.h"

#include "qitrmcwebsvc/RequestResource.h"

namespace nQITRMCWEBSVC100 {

void ReserveDevices::run(const JsonValue& params, const std::shared_ptr<SessionContext>& session,
                         SingleResponse& response) {
    const RequestResource resource(params, session->driverSession, ResourceKind::Device);
    const ReservationParams reservation = reservationParams(params);
    sessionManager->reserveDevices(sessionIdOf(params), resource.names(), reservation.access,
                                   reservation.group, reservation.timeout);
    response.setEmptyResult();
}

}  // namespace nQITRMCWEBSVC100
