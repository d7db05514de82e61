#include "qitrmcwebsvc/procedure/GetCommandInformation.h"

#include <qitrmcapi.h>

#include <utility>

#include "qitrmcwebsvc/DriverOwners.h"
#include "qitrmcwebsvc/RequestResource.h"
#include "qitrmcwebsvc/callDriver.h"
#include "qitrmcwebsvc/procedure/jsonValues.h"

namespace nQITRMCWEBSVC100 {
namespace {

// Sorted by key, which is the order of the result.
constexpr std::pair<const char*, const char*> CommandInfoKeys[] = {
    {"description", "Cmd.Descr"},
    {"document", "Cmd.Doc"},
};

}  // namespace

void GetCommandInformation::run(const JsonValue& params,
                                const std::shared_ptr<SessionContext>& session,
                                SingleResponse& response) {
    const RequestResource resource(params, session->driverSession, session->defaultResourceKind);
    const std::string command = textParam(params, "command");
    DriverCommand handle;
    callDriver(nQITRMCAPI100_openGenericCommand, session->driverSession,
               resource.joinedNames().c_str(), command.c_str(), handle.out());

    JsonPool& pool = *response.getAllocator();
    JsonValue result(rapidjson::kObjectType);
    for (const auto& [key, attribute] : CommandInfoKeys) {
        DriverString text;
        callDriver(nQITRMCAPI100_getCommandPropertyString, handle.get(), attribute, text.out());
        if (text.get() == nullptr)
            throw nQITRMCSHAREDCMN100::InternalError("Fail to get command information.",
                                                     QITRMC_HERE);
        result.AddMember(rapidjson::StringRef(key), textValue(text.get(), pool), pool);
    }
    response.setResult(result);
}

}  // namespace nQITRMCWEBSVC100
