#include "qitrmcwebsvc/SingleResponse.h"

#include <algorithm>
#include <array>
#include <string>
#include <utility>

#include "qierr/Status.h"
#include "qisysq/FileLooks.h"
#include "qitrmcwebsvc/describeStatus.h"

namespace nQITRMCWEBSVC100 {
namespace {

// The codes of JSON-RPC itself, which are sent without "data". Every other failure is sent as a
// server error, with its own code and text in "data".
constexpr std::array<std::int32_t, 6> jsonRpcCodes = {
    qierr::codes::parseError,    qierr::codes::rpcInternalError, qierr::codes::invalidParams,
    qierr::codes::unknownMethod, qierr::codes::invalidRequest,   qierr::codes::serverError};

bool isStandingCode(std::int32_t code) {
    return std::find(jsonRpcCodes.begin(), jsonRpcCodes.end(), code) != jsonRpcCodes.end();
}

std::string describeServerError() {
    qierr::Status status;
    qierr_Status_setCode(&status, qierr::codes::serverError);
    return describeStatus(status);
}

}  // namespace

SingleResponse::SingleResponse(JsonAllocator* allocator) : SingleResponse(JsonValue(), allocator) {}

SingleResponse::SingleResponse(const JsonValue& id, JsonAllocator* allocator)
    : response(rapidjson::kObjectType), allocator(allocator) {
    response.AddMember("jsonrpc", "2.0", *allocator);
    JsonValue copiedId(id, *allocator);
    response.AddMember("id", copiedId, *allocator);
}

void SingleResponse::setResult(JsonValue&& value) {
    response.AddMember("result", value, *allocator);
}

void SingleResponse::setEmptyResult() {
    setResult(JsonValue(rapidjson::kObjectType));
}

void SingleResponse::setError(const qierr_Status& status) {
    const qisysq::FileLooks looks;
    JsonValue error(rapidjson::kObjectType);
    JsonValue data(rapidjson::kObjectType);
    const std::string text = describeStatus(status);
    if (isStandingCode(status.code)) {
        error.AddMember("code", status.code, *allocator);
        error.AddMember("message", JsonValue(text, *allocator), *allocator);
    } else {
        error.AddMember("code", qierr::codes::serverError, *allocator);
        error.AddMember("message", JsonValue(describeServerError(), *allocator), *allocator);
        data.AddMember("qitrmc_code", status.code, *allocator);
        data.AddMember("qitrmc_message", JsonValue(text, *allocator), *allocator);
        error.AddMember("data", data, *allocator);
    }
    setError(std::move(error));
}

void SingleResponse::setError(JsonValue&& error) {
    response.AddMember("error", error, *allocator);
}

}  // namespace nQITRMCWEBSVC100
