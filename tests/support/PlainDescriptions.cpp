#include "support/PlainDescriptions.h"

#include <atomic>
#include <string>

#include "qierr/Exception.h"
#include "qitrmcwebsvc/Json.h"
#include "qitrmcwebsvc/describeStatus.h"

namespace {

using nQITRMCWEBSVC100::JsonBuffer;
using nQITRMCWEBSVC100::JsonDocument;
using nQITRMCWEBSVC100::JsonPointer;
using nQITRMCWEBSVC100::JsonValue;
using nQITRMCWEBSVC100::JsonWriter;

std::atomic<int> failuresLeft{0};
std::atomic<int> successesLeft{0};

std::string text(const JsonValue& value) {
    if (value.IsString()) {
        return value.GetString();
    }
    JsonBuffer buffer;
    JsonWriter writer(buffer);
    value.Accept(writer);
    return buffer.GetString();
}

// A status that ran out of memory, or that a broken driver made, may lack any member.
std::string member(const JsonValue& item, const char* name) {
    const auto found = item.FindMember(name);
    return found != item.MemberEnd() ? text(found->value) : "";
}

std::string describedItem(const JsonValue& item) {
    if (item.HasMember("usage")) {
        return " " + member(item, "usage") + "=" + member(item, "value");
    }
    return " comment=" + member(item, "comment");
}

void failIfAsked() {
    if (failuresLeft == 0 || successesLeft-- > 0) {
        return;
    }
    --failuresLeft;
    qierr::Status status;
    qierr_Status_setCode(&status, -52006);
    throw qierr::Exception(&status);
}

}  // namespace

void plainDescriptions::failNext(int count, int skipped) {
    failuresLeft = count;
    successesLeft = skipped;
}

std::string nQITRMCWEBSVC100::describeStatus(const qierr_Status& status) {
    failIfAsked();
    std::string description = std::to_string(status.code);
    JsonDocument details;
    details.Parse<rapidjson::kParseIterativeFlag>(status.json != nullptr ? status.json : "{}");
    const JsonValue* items = JsonPointer("/translator_info/ordered_data").Get(details);
    if (items == nullptr || !items->IsArray()) {
        return description;
    }
    for (const JsonValue& item : items->GetArray()) {
        if (item.IsObject()) {
            description += describedItem(item);
        }
    }
    return description;
}
