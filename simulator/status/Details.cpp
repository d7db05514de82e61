#include "status/Details.h"

#include <cstdio>

#include "common/utf8.h"

namespace simulator {

namespace {

constexpr std::string_view replacementCharacter = "\xEF\xBF\xBD";

void appendEscaped(std::string& out, unsigned char byte) {
    char escape[8];
    if (byte == '"' || byte == '\\') {
        out += '\\';
        out += static_cast<char>(byte);
    } else if (byte < 0x20 || byte == 0x7F) {
        std::snprintf(escape, sizeof escape, "\\u%04x", static_cast<unsigned>(byte));
        out += escape;
    } else {
        out += static_cast<char>(byte);
    }
}

std::string quotedList(const std::vector<std::string>& values) {
    std::string out = "[";
    for (const std::string& value : values) {
        out += (out.size() == 1 ? "" : ",") + quoted(value);
    }
    return out += ']';
}

}  // namespace

std::string quoted(std::string_view text) {
    std::string out = "\"";
    while (!text.empty()) {
        const common::Utf8Character character = common::takeCharacter(text);
        if (!character.isValid()) {
            out += replacementCharacter;
        } else if (character.bytes.size() == 1) {
            appendEscaped(out, static_cast<unsigned char>(character.bytes.front()));
        } else {
            out += character.bytes;
        }
    }
    return out += '"';
}

void Details::addEntry(std::string_view type, std::string_view usage, std::string_view rest) {
    entries += entries.empty() ? "{\"type\":" : ",{\"type\":";
    entries += quoted(type);
    if (!usage.empty()) {
        entries += ",\"usage\":" + quoted(usage);
    }
    entries += rest;
    entries += '}';
}

void Details::addUsage(std::string_view tag, std::string_view value) {
    addEntry("usage", tag, ",\"value\":" + quoted(value) + ",\"value_type\":\"string\"");
}

void Details::addUsage(std::string_view tag, std::uint32_t value) {
    addEntry("usage", tag, ",\"value\":" + std::to_string(value) + ",\"value_type\":\"uint32_t\"");
}

void Details::addUsage(std::string_view tag, const std::vector<std::string>& values) {
    addEntry("usage", tag, ",\"value\":" + quotedList(values) + ",\"value_type\":\"string\"");
}

void Details::addUsageEnum(std::string_view tag, std::int32_t value, std::uint32_t id) {
    addEntry("usage", tag,
             ",\"value\":" + std::to_string(value) +
                 ",\"value_type\":{\"type\":\"enum\",\"id\":" + std::to_string(id) + "}");
}

void Details::addElaboration(std::string_view term) {
    addEntry("elaboration", term, "");
}

void Details::addHeader(std::string_view term) {
    addEntry("header", term, "");
}

void Details::addEmpty() {
    addEntry("empty", "", "");
}

void Details::addCause(std::int32_t code, const char* constant, const Details& details) {
    causes.push_back("{\"code\":" + std::to_string(code) + "," + details.members(constant) + "}");
}

std::string Details::members(const char* constant) const {
    std::string out;
    if (constant != nullptr) {
        out = "\"error_constant\":" + quoted(constant) + ",";
    }
    out +=
        "\"component\":\"qitrmcapi\",\"translator\":\"mxlator_qitrmc\""
        ",\"translator_info\":{\"ordered_data\":[" +
        entries + "]}";
    if (causes.size() == 1) {
        out += ",\"nested_error\":" + causes.front();
    } else if (!causes.empty()) {
        out += ",\"nested_error\":[";
        for (const std::string& cause : causes) {
            out += (out.back() == '[' ? "" : ",") + cause;
        }
        out += ']';
    }
    return out;
}

std::string Details::text(const char* constant) const {
    return "{" + members(constant) + "}";
}

}  // namespace simulator
