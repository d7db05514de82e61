#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <ostream>
#include <string>

#include "qitrmcsharedcmn/Exceptions.h"
#include "qitrmcwebsvc/SchemaValidator.h"

namespace nQITRMCWEBSVC100 {

// The code and details that a refusal put into a status.
struct Refusal {
    std::int32_t code;
    std::string orderedData;  // the array's JSON text, "" when there is none

    bool operator==(const Refusal& other) const {
        return code == other.code && orderedData == other.orderedData;
    }
};

inline std::ostream& operator<<(std::ostream& stream, const Refusal& refusal) {
    return stream << refusal.code << " " << refusal.orderedData;
}

// The bytes of the details in a status text, which are at its end.
inline std::string orderedDataOf(const qierr_Status& status) {
    const std::string text = status.json ? status.json : "";
    const std::string opening = "\"translator_info\":{\"ordered_data\":";
    const std::size_t start = text.find(opening);
    if (start == std::string::npos) {
        return "";
    }
    const std::size_t first = start + opening.size();
    return text.substr(first, text.size() - 2 - first);
}

// The refusal with which `action` ends, or nothing when it returns.
template <typename Action>
std::optional<Refusal> refusalOf(Action action) {
    try {
        action();
    } catch (const qierr::ExceptionBase& error) {
        return Refusal{error.status()->code, orderedDataOf(*error.status())};
    }
    return std::nullopt;
}

inline std::string usage(const std::string& tag, const std::string& value) {
    return R"({"type":"usage","usage":")" + tag + R"(","value":")" + value +
           R"(","value_type":"string"})";
}

inline Refusal invalidMember(const std::string& name) {
    return {-32600, "[" + usage("kUsageTypeInvalidMember", name) + "]"};
}

inline Refusal invalidParameter(const std::string& pointer, const std::string& details) {
    return {-32602, "[" + usage("kUsageTypeParameter", pointer) + "," +
                        usage("kUsageTypeDetails", details) + "]"};
}

inline Refusal internalFault(const std::string& comment) {
    return {-250800, R"([{"type":"comment","comment":")" + comment + R"("}])"};
}

// A request, with the document that owns it.
class ParsedRequest {
  public:
    explicit ParsedRequest(const std::string& text) {
        document->Parse(text.data(), text.size());
        request = std::make_unique<SingleRequest>(*document);
    }

    const SingleRequest& operator*() const { return *request; }

  private:
    std::unique_ptr<JsonDocument> document = std::make_unique<JsonDocument>();
    std::unique_ptr<SingleRequest> request;
};

inline std::string requestText(const std::string& method, const std::string& params) {
    return R"({"jsonrpc":"2.0","id":1,"method":")" + method + R"(","params":)" + params + "}";
}

}  // namespace nQITRMCWEBSVC100
