#include <qitrmcapi.h>

#include <utility>

#include "qitrmcwebsvc/DriverOwners.h"
#include "qitrmcwebsvc/RequestResource.h"
#include "qitrmcwebsvc/callDriver.h"
#include "qitrmcwebsvc/procedure/jsonValues.h"
#include "qitrmcwebsvc/procedure/procedures.h"

namespace nQITRMCWEBSVC100 {
namespace {

// Sorted by key, which is the order of the result.
constexpr std::pair<const char*, const char*> commandInfoKeys[] = {
    {"description", "Cmd.Descr"},
    {"document", "Cmd.Doc"},
};

}  // namespace

// Reads the description of a command. Result: description, document.
void GetCommandInformation::run(const JsonValue& params, SingleResponse& response) const {
    const std::shared_ptr<SessionContext> session = sessionOf(params);
    const RequestResource resource(params, *session);
    const std::string command = textParam(params, "command");
    DriverCommand handle;
    callDriver(nQITRMCAPI100_openGenericCommand, session->driverSession,
               resource.joinedNames().c_str(), command.c_str(), handle.out());

    JsonAllocator& allocator = *response.getAllocator();
    JsonValue result(rapidjson::kObjectType);
    for (const auto& [key, attribute] : commandInfoKeys) {
        DriverString text;
        callDriver(nQITRMCAPI100_getCommandPropertyString, handle.get(), attribute, text.out());
        if (text.get() == nullptr) {
            throw nQITRMCSHAREDCMN100::InternalError("Fail to get command information.",
                                                     QITRMC_HERE);
        }
        result.AddMember(rapidjson::StringRef(key), textValue(text.get(), allocator), allocator);
    }
    response.setResult(std::move(result));
}

}  // namespace nQITRMCWEBSVC100
