#include "explain/pastedJson.h"

#include <charconv>
#include <cstring>

#include "jsonz/jsonz.h"

namespace explain {
namespace {

jsonz_value read(const char* position) {
    jsonz_value value{};
    jsonz_readValue(position, &value);
    return value;
}

// The member with this name if it is an object. Null otherwise.
const char* objectMember(const char* object, const char* key) {
    const char* const member = jsonz_findMember(object, key);
    return read(member).type == jsonz_typeObject ? member : nullptr;
}

// Empty if the member is 0 or not a 32-bit integer.
std::optional<std::int32_t> codeMember(const char* object, const char* key) {
    const jsonz_value value = read(jsonz_findMember(object, key));
    if (value.type != jsonz_typeNumber) {
        return std::nullopt;
    }
    std::int32_t code = 0;
    const char* const end = value.text + value.length;
    const auto [stop, error] = std::from_chars(value.text, end, code);
    if (error != std::errc() || stop != end || code == 0) {
        return std::nullopt;
    }
    return code;
}

// An error object has a message in addition to its code; details have none.
bool isErrorObject(const char* object) {
    return read(jsonz_findMember(object, "message")).type == jsonz_typeString;
}

std::optional<Question> questionOfObject(const char* object) {
    const char* error = objectMember(object, "error");
    if (error == nullptr) {
        error = object;
    }
    const char* data = objectMember(error, "data");
    if (data == nullptr) {
        data = error;
    }
    if (const auto code = codeMember(data, "qitrmc_code")) {
        return Question{*code, {}};
    }
    const auto code = codeMember(error, "code");
    if (!code) {
        return std::nullopt;
    }
    if (isErrorObject(error)) {
        return Question{*code, {}};
    }
    return Question{*code, {error, jsonz_readValue(error, nullptr)}};
}

std::optional<Question> questionOfArray(const char* array) {
    const char* element = jsonz_firstElement(array);
    while (element != nullptr) {
        if (const auto question = questionOfObject(element)) {
            return question;
        }
        element = jsonz_nextElement(jsonz_readValue(element, nullptr));
    }
    return std::nullopt;
}

}  // namespace

bool isContainer(const std::string& text) {
    jsonz_value value{};
    const char* const end = jsonz_readValue(text.c_str(), &value);
    if (end == nullptr || (value.type != jsonz_typeObject && value.type != jsonz_typeArray)) {
        return false;
    }
    return end + std::strspn(end, " \t\r\n") == text.c_str() + text.size();
}

std::optional<Question> findQuestion(const std::string& json) {
    if (read(json.c_str()).type == jsonz_typeArray) {
        return questionOfArray(json.c_str());
    }
    return questionOfObject(json.c_str());
}

}  // namespace explain
