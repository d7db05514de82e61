#include "support/responseFault.h"

#include <initializer_list>

#include "qitrmcwebsvc/Json.h"

namespace {

using nQITRMCWEBSVC100::JsonDocument;
using nQITRMCWEBSVC100::JsonValue;

bool hasExactly(const JsonValue& value, std::initializer_list<const char*> names) {
    if (!value.IsObject() || value.MemberCount() != names.size()) {
        return false;
    }
    auto member = value.MemberBegin();
    for (const char* name : names) {
        if (member++->name != name) {
            return false;
        }
    }
    return true;
}

std::string errorFault(const JsonValue& error) {
    const bool hasData = hasExactly(error, {"code", "message", "data"});
    if (!hasData && !hasExactly(error, {"code", "message"})) {
        return "members of the error";
    }
    if (!error["code"].IsInt() || !error["message"].IsString()) {
        return "types in the error";
    }
    const std::int32_t code = error["code"].GetInt();
    if (hasData ? code != -32000
                : code != -32000 && (code < -32603 || code > -32600) && code != -32700) {
        return "code of the error";
    }
    if (!hasData) {
        return "";
    }
    const JsonValue& data = error["data"];
    if (!hasExactly(data, {"qitrmc_code", "qitrmc_message"})) {
        return "members of the data";
    }
    return data["qitrmc_code"].IsInt() && data["qitrmc_message"].IsString() ? ""
                                                                            : "types in the data";
}

std::string objectFault(const JsonValue& response) {
    const bool isError = hasExactly(response, {"jsonrpc", "id", "error"});
    if (!isError && !hasExactly(response, {"jsonrpc", "id", "result"})) {
        return "members of the response";
    }
    if (response["jsonrpc"] != "2.0") {
        return "version";
    }
    return isError ? errorFault(response["error"]) : "";
}

std::int32_t outcomeIn(const JsonValue& response) {
    const auto error = response.FindMember("error");
    if (error == response.MemberEnd()) {
        return 0;
    }
    const auto data = error->value.FindMember("data");
    return data == error->value.MemberEnd() ? error->value["code"].GetInt()
                                            : data->value["qitrmc_code"].GetInt();
}

}  // namespace

std::string responseFault(const std::string& text) {
    JsonDocument document;
    // Text after a NUL must not be overlooked.
    document.Parse<rapidjson::kParseIterativeFlag>(text.data(), text.size());
    if (document.HasParseError() || text.find('\0') != text.npos) {
        return "not one JSON value";
    }
    if (!document.IsArray()) {
        return objectFault(document);
    }
    if (document.Empty()) {
        return "empty array";
    }
    for (const JsonValue& response : document.GetArray()) {
        if (const std::string fault = objectFault(response); !fault.empty()) {
            return fault;
        }
    }
    return "";
}

std::vector<std::int32_t> outcomesIn(const std::string& text) {
    JsonDocument document;
    document.Parse<rapidjson::kParseIterativeFlag>(text.data(), text.size());
    std::vector<std::int32_t> outcomes;
    if (!document.IsArray()) {
        return {outcomeIn(document)};
    }
    for (const JsonValue& response : document.GetArray()) {
        outcomes.push_back(outcomeIn(response));
    }
    return outcomes;
}
