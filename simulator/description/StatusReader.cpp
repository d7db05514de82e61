#include "description/StatusReader.h"

#include <string>
#include <vector>

#include "Members.h"

namespace simulator {

namespace {

std::string readKey(const Node& node) {
    const std::string key = node.text();
    if (key.empty()) {
        node.fail("is empty", "must be the key of a label or phrase");
    }
    return key;
}

void readEnumUsage(const Node& node, const std::string& key, const Enumerations& enumerations,
                   Refusal& status) {
    const Node itemNode = node.member("item", "the number of an item");
    const Node nameNode = node.member("enum", "the name of an enumeration");
    const auto found = enumerations.find(nameNode.text());
    if (found == enumerations.end()) {
        nameNode.fail("is not a known enumeration", "must be a member of /enums of the chassis");
    }
    status.usageEnum(key, itemNode.signedNumber(), found->second->id);
}

void readUsageValue(const Node& value, const std::string& key, Refusal& status) {
    if (value.json().IsString()) {
        status.usage(key, value.text());
    } else if (value.json().IsUint()) {
        status.usage(key, value.unsignedNumber(0, UINT32_MAX));
    } else {
        value.expect(value.json().IsArray(),
                     "a text, a whole number of 32 bits that is not below 0, or an array of texts");
        std::vector<std::string> texts;
        value.forEachElement([&](const Node& text) { texts.push_back(text.text()); });
        status.usage(key, texts);
    }
}

void readUsage(const Node& node, const Enumerations& enumerations, Refusal& status) {
    const std::string key = readKey(node.member("usage", ""));
    if (node.has("item") || node.has("enum")) {
        node.expectMembers(members::usageItem);
        readEnumUsage(node, key, enumerations, status);
    } else {
        node.expectMembers(members::usageValue);
        readUsageValue(node.member("value", "a text, a number or an array of texts"), key, status);
    }
}

void readEntry(const Node& node, const Enumerations& enumerations, Refusal& status) {
    node.expectMembers(members::entry);
    if (node.has("usage")) {
        readUsage(node, enumerations, status);
    } else if (node.has("elaboration")) {
        node.expectMembers(members::elaboration);
        status.elaboration(readKey(node.member("elaboration", "")));
    } else if (node.has("header")) {
        node.expectMembers(members::header);
        status.header(readKey(node.member("header", "")));
    } else {
        const Node flag = node.member("empty", "there, unless usage, elaboration or header is");
        node.expectMembers(members::emptyLine);
        flag.expect(flag.flag(), "true");
        status.empty();
    }
}

std::int32_t readCode(const Node& node) {
    const Node codeNode = node.member("code", "the number of the status");
    const std::int32_t code = codeNode.signedNumber();
    codeNode.expect(code != 0, "a number other than 0, which means success");
    return code;
}

Refusal readNested(const Node& node, const Enumerations& enumerations, int depth) {
    if (depth > mostCauseDepth) {
        node.fail("is nested too deep", "causes are nested at most 16 deep");
    }
    node.expectMembers(members::nestedStatus);
    const std::int32_t code = readCode(node);
    std::optional<std::string> constant;
    node.ifPresent("constant", [&](const Node& name) { constant = name.text(); });
    Refusal status(code, std::move(constant));
    node.ifPresent("details", [&](const Node& entries) {
        entries.forEachElement([&](const Node& entry) { readEntry(entry, enumerations, status); });
    });
    node.ifPresent("causes", [&](const Node& causes) {
        causes.forEachElement(
            [&](const Node& cause) { status.cause(readNested(cause, enumerations, depth + 1)); });
    });
    return status;
}

}  // namespace

Refusal readStatus(const Node& node, const Enumerations& enumerations) {
    node.expectMembers(members::status);
    if (!node.has("json")) {
        return readNested(node, enumerations, 0);
    }
    node.expectMembers(members::writtenStatus);
    return Refusal(readCode(node), std::nullopt).ownText(node.member("json", "").text());
}

}  // namespace simulator
