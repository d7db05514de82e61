#include "qitrmcwebsvc/SchemaRun.h"

#include <algorithm>

namespace nQITRMCWEBSVC100 {
namespace {

// The maximum number of bytes after the first one of a UTF-8 sequence.
constexpr std::size_t mostFollowingBytes = 3;

bool isUnreserved(char c) {
    return (c >= '0' && c <= '9') || (c >= 'A' && c <= 'Z') || (c >= 'a' && c <= 'z') || c == '-' ||
           c == '.' || c == '_';
}

void appendEscaped(std::string& text, char c) {
    constexpr const char* hexDigits = "0123456789ABCDEF";
    const auto byte = static_cast<unsigned char>(c);
    if (c == '~') {
        text += "~0";
    } else if (c == '/') {
        text += "~1";
    } else if (isUnreserved(c)) {
        text += c;
    } else {
        text += {'%', hexDigits[byte >> 4], hexDigits[byte & 15]};
    }
}

// Replaces the JSON library's function, which reads past the end of a name that ends in a truncated
// UTF-8 sequence. Here each byte is escaped by itself, so a name need not be valid UTF-8.
std::string uriFragment(const JsonPointer& pointer) {
    std::string text = "#";
    for (std::size_t i = 0; i < pointer.GetTokenCount(); ++i) {
        const JsonPointer::Token& token = pointer.GetTokens()[i];
        text += '/';
        for (rapidjson::SizeType at = 0; at < token.length; ++at) {
            appendEscaped(text, token.name[at]);
        }
    }
    return text;
}

// Whether the text may end in a truncated UTF-8 sequence.
bool mayEndInTruncatedUtf8(const JsonValue& text) {
    const char* const end = text.GetString() + text.GetStringLength();
    const auto inspected = std::min<std::size_t>(mostFollowingBytes, text.GetStringLength());
    return std::any_of(end - inspected, end,
                       [](char c) { return static_cast<unsigned char>(c) >= 0xC0; });
}

}  // namespace

SchemaRun::SchemaRun(const JsonSchemaDocument& schema)
    : validator(*new(memory.Malloc(sizeof(Validator))) Validator(schema, &memory)) {}

bool SchemaRun::accepts(const JsonValue& request) {
    return visit(request, 1);
}

bool SchemaRun::visit(const JsonValue& value, int depth) {
    const bool isContainer = value.IsObject() || value.IsArray();
    if (isContainer && depth >= depthPassedAsNull) {
        return validator.Null();
    }
    if (value.IsObject()) {
        return visitObject(value, depth);
    }
    if (value.IsArray()) {
        return visitArray(value, depth);
    }
    if (value.IsString() && mayEndInTruncatedUtf8(value)) {
        return visitTruncatedText(value);
    }
    return value.Accept(validator);
}

// For a truncated UTF-8 sequence the pattern engine reads past the end of the text, so the text is
// copied with NULs after it.
bool SchemaRun::visitTruncatedText(const JsonValue& text) {
    std::string followed(text.GetString(), text.GetStringLength());
    followed.append(mostFollowingBytes, '\0');
    return validator.String(followed.data(), text.GetStringLength(), true);
}

bool SchemaRun::visitObject(const JsonValue& object, int depth) {
    if (!validator.StartObject()) {
        return false;
    }
    for (const auto& member : object.GetObject()) {
        if (!validator.Key(member.name.GetString(), member.name.GetStringLength(), false) ||
            !visit(member.value, depth + 1)) {
            return false;
        }
    }
    return validator.EndObject(object.MemberCount());
}

bool SchemaRun::visitArray(const JsonValue& array, int depth) {
    if (!validator.StartArray()) {
        return false;
    }
    for (const JsonValue& element : array.GetArray()) {
        if (!visit(element, depth + 1)) {
            return false;
        }
    }
    return validator.EndArray(array.Size());
}

SchemaFailure SchemaRun::failure() const {
    const char* const keyword = validator.GetInvalidSchemaKeyword();
    return {uriFragment(validator.GetInvalidDocumentPointer()),
            uriFragment(validator.GetInvalidSchemaPointer()), keyword ? keyword : ""};
}

}  // namespace nQITRMCWEBSVC100
