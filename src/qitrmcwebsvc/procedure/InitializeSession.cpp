#include "qitrmcwebsvc/procedure/InitializeSession.h"

#include "qitrmcwebsvc/RequestResource.h"

namespace nQITRMCWEBSVC100 {

void InitializeSession::run(const JsonValue& params, SingleResponse& response) {
    const ReservationParams reservation = reservationParams(params);
    const bool forceReserve = boolParam(params, "force_reserve", false);
    const RequestResource resource(params);
    // A session without resources reserves nothing, whatever the reservation parameters say.
    const std::string id =
        resource.kind() == ResourceKind::None
            ? sessionManager->createSession()
            : sessionManager->createSession(resource.kind(), resource.names(), reservation.access,
                                            reservation.group, reservation.timeout, forceReserve);
    JsonPool& pool = *response.getAllocator();
    JsonValue result(rapidjson::kObjectType);
    result.AddMember("session_id", JsonValue(id, pool), pool);
    response.setResult(result);
}

}  // namespace nQITRMCWEBSVC100
