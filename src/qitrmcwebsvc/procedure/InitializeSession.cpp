#include "qitrmcwebsvc/RequestResource.h"
#include "qitrmcwebsvc/procedure/procedures.h"

namespace nQITRMCWEBSVC100 {

// Opens a session, with or without resources and their reservation. Result: session_id.
void InitializeSession::run(const JsonValue& params, SingleResponse& response) const {
    const ReservationParams reservation = reservationParams(params);
    const bool forceReserve = boolParam(params, "force_reserve", false);
    const RequestResource resource(params);
    // A session without resources reserves nothing, so the reservation parameters are ignored.
    const std::string id =
        resource.kind() == ResourceKind::None
            ? sessionManager->createSession()
            : sessionManager->createSession(resource.kind(), resource.names(), reservation.access,
                                            reservation.group, reservation.timeout, forceReserve);
    JsonAllocator& allocator = *response.getAllocator();
    JsonValue result(rapidjson::kObjectType);
    result.AddMember("session_id", JsonValue(id, allocator), allocator);
    response.setResult(std::move(result));
}

}  // namespace nQITRMCWEBSVC100
