#include "qitrmcwebsvc/requestText.h"

#include <cmath>
#include <optional>

#include "qitrmcsharedcmn/Exceptions.h"
#include "qitrmcwebsvc/exponentGuard.h"

namespace nQITRMCWEBSVC100 {

using namespace nQITRMCSHAREDCMN100;

namespace {

// Stands between the reader and the document: refuses what the reader lets through although the
// rest of the service, or a response that quotes the request, could not carry it.
class GuardedDocument {
  public:
    using Ch = JsonDocument::Ch;
    using SizeType = rapidjson::SizeType;

    explicit GuardedDocument(JsonDocument& guarded) : document(guarded) {}

    // The reader's own check misses some literals that are too big, such as 10e308.
    bool numberTooBig() const { return sawInfinity; }

    bool Double(double value) {
        sawInfinity = std::isinf(value);
        return !sawInfinity && document.Double(value);
    }
    bool StartObject() { return enter() && document.StartObject(); }
    bool EndObject(SizeType members) {
        --depth;
        return document.EndObject(members);
    }
    bool StartArray() { return enter() && document.StartArray(); }
    bool EndArray(SizeType elements) {
        --depth;
        return document.EndArray(elements);
    }

    bool Null() { return document.Null(); }
    bool Bool(bool value) { return document.Bool(value); }
    bool Int(int value) { return document.Int(value); }
    bool Uint(unsigned value) { return document.Uint(value); }
    bool Int64(std::int64_t value) { return document.Int64(value); }
    bool Uint64(std::uint64_t value) { return document.Uint64(value); }
    bool RawNumber(const Ch* text, SizeType length, bool copy) {
        return document.RawNumber(text, length, copy);
    }
    bool String(const Ch* text, SizeType length, bool copy) {
        return document.String(text, length, copy);
    }
    bool Key(const Ch* text, SizeType length, bool copy) {
        return document.Key(text, length, copy);
    }

  private:
    bool enter() { return ++depth <= maxNesting; }

    JsonDocument& document;
    int depth = 0;
    bool sawInfinity = false;
};

const char* parseErrorText(rapidjson::ParseErrorCode code) {
    switch (code) {
        case rapidjson::kParseErrorNone:
            return "No error.";
        case rapidjson::kParseErrorDocumentEmpty:
            return "The document is empty.";
        case rapidjson::kParseErrorDocumentRootNotSingular:
            return "The document root must not be followed by other values.";
        case rapidjson::kParseErrorValueInvalid:
            return "Invalid value.";
        case rapidjson::kParseErrorObjectMissName:
            return "Missing a name for object member.";
        case rapidjson::kParseErrorObjectMissColon:
            return "Missing a colon after a name of object member.";
        case rapidjson::kParseErrorObjectMissCommaOrCurlyBracket:
            return "Missing a comma or '}' after an object member.";
        case rapidjson::kParseErrorArrayMissCommaOrSquareBracket:
            return "Missing a comma or ']' after an array element.";
        case rapidjson::kParseErrorStringUnicodeEscapeInvalidHex:
            return "Incorrect hex digit after \\u escape in string.";
        case rapidjson::kParseErrorStringUnicodeSurrogateInvalid:
            return "The surrogate pair in string is invalid.";
        case rapidjson::kParseErrorStringEscapeInvalid:
            return "Invalid escape character in string.";
        case rapidjson::kParseErrorStringMissQuotationMark:
            return "Missing a closing quotation mark in string.";
        case rapidjson::kParseErrorStringInvalidEncoding:
            return "Invalid encoding in string.";
        case rapidjson::kParseErrorNumberTooBig:
            return "Number too big to be stored in double.";
        case rapidjson::kParseErrorNumberMissFraction:
            return "Miss fraction part in number.";
        case rapidjson::kParseErrorNumberMissExponent:
            return "Miss exponent in number.";
        case rapidjson::kParseErrorTermination:
            return "Terminate parsing due to Handler error.";
        case rapidjson::kParseErrorUnspecificSyntaxError:
            return "Unspecific syntax error.";
        default:
            return "Unknown error.";
    }
}

}  // namespace

void parseRequestText(const std::string& body, JsonDocument& document) {
    const std::optional<std::string> guardedBody = withSafeExponents(body.c_str());
    rapidjson::StringStream stream(guardedBody ? guardedBody->c_str() : body.c_str());
    JsonReader reader;
    GuardedDocument handler(document);
    auto parse = [&](JsonDocument&) {
        return !reader.Parse<rapidjson::kParseDefaultFlags>(stream, handler).IsError();
    };
    document.Populate(parse);
    if (!reader.HasParseError())
        return;
    const auto code =
        handler.numberTooBig() ? rapidjson::kParseErrorNumberTooBig : reader.GetParseErrorCode();
    BasicError error(qierr::codes::parseError, QITRMC_HERE);
    addUsageUInt32(addUsageString(error.details(), "kUsageTypeDetails", parseErrorText(code)),
                   "kUsageTypeOffset", static_cast<std::uint32_t>(reader.GetErrorOffset()));
    throw error;
}

}  // namespace nQITRMCWEBSVC100
