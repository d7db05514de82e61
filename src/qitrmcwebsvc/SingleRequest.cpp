#include "qitrmcwebsvc/SingleRequest.h"

#include <cstring>
#include <utility>

#include "qitrmcsharedcmn/Exceptions.h"
#include "qitrmcwebsvc/findMember.h"

namespace nQITRMCWEBSVC100 {
namespace {

using nQITRMCSHAREDCMN100::BasicError;

[[noreturn]] void throwInvalidMember(const char* name, const qierr_SourcePosition& position) {
    BasicError error(qierr::codes::invalidRequest, position);
    addUsageString(error.details(), "kUsageTypeInvalidMember", name);
    throw error;
}

// Returns the method.
const JsonValue& checkEnvelope(const JsonValue& value) {
    if (!value.IsObject() || value.ObjectEmpty()) {
        throw BasicError(qierr::codes::invalidRequest, QITRMC_HERE);
    }

    const JsonValue* const id = findMember(value, "id");
    if (!id || !(id->IsInt() || id->IsString())) {
        throwInvalidMember("id", QITRMC_HERE);
    }

    const JsonValue* const version = findMember(value, "jsonrpc");
    if (!version || !version->IsString() || std::strcmp(version->GetString(), "2.0") != 0) {
        throwInvalidMember("jsonrpc", QITRMC_HERE);
    }

    const JsonValue* const method = findMember(value, "method");
    if (!method || !method->IsString()) {
        throwInvalidMember("method", QITRMC_HERE);
    }
    return *method;
}

}  // namespace

SingleRequest::SingleRequest(JsonValue& value)
    : method(checkEnvelope(value).GetString()), params(findMember(value, "params")) {
    request = std::move(value);
}

const JsonValue& SingleRequest::getParams() const {
    static const JsonValue absent;
    return params ? *params : absent;
}

}  // namespace nQITRMCWEBSVC100
