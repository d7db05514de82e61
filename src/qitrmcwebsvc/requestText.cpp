#include "qitrmcwebsvc/requestText.h"

#include <charconv>
#include <cmath>
#include <cstring>
#include <limits>
#include <new>
#include <optional>
#include <system_error>

#include <rapidjson/error/en.h>

#include "qitrmcsharedcmn/Exceptions.h"
#include "qitrmcwebsvc/LongArrays.h"
#include "qitrmcwebsvc/exponentGuard.h"

namespace nQITRMCWEBSVC100 {

using namespace nQITRMCSHAREDCMN100;

namespace {

// The nearest double to the literal at `text`. `approximation` is a value close to it. The reader's
// own exact conversion cannot be used: for long literals that begin with small digits it reads
// outside its tables, and for some others its result is far off.
double nearestDouble(const char* text, const char* textEnd, double approximation) {
    double value = 0.0;
    const std::errc failure = std::from_chars(text, textEnd, value).ec;
    if (failure == std::errc()) {
        return value;
    }
    const bool tooBig = std::fabs(approximation) > 1.0;
    return std::copysign(tooBig ? std::numeric_limits<double>::infinity() : 0.0, approximation);
}

using JsonStream = rapidjson::GenericInsituStringStream<JsonEncoding>;

// Receives the values that the reader parses and adds them to the document. It rejects values that
// the reader accepts but the rest of the service cannot process or print.
class GuardedDocument {
  public:
    using Ch = JsonDocument::Ch;
    using SizeType = rapidjson::SizeType;

    // `read` is the stream of the reader; its text ends at `end`.
    GuardedDocument(JsonDocument& guarded, const JsonStream& read, const char* end)
        : document(guarded), longArrays(guarded), stream(read), textEnd(end) {}

    // Completes the document after the text was parsed.
    void finish() { longArrays.place(); }

    // The reader itself does not detect all literals that are too big, for example 10e308.
    bool numberTooBig() const { return sawInfinity; }

    bool Double(double approximation) {
        // The reader advances its stream only after this function, so the literal begins there.
        const double value = nearestDouble(stream.src_, textEnd, approximation);
        sawInfinity = std::isinf(value);
        return !sawInfinity && add(value, &JsonDocument::Double);
    }
    bool StartObject() { return enter() && document.StartObject(); }
    bool EndObject(SizeType members) {
        --depth;
        return document.EndObject(members);
    }
    bool StartArray() {
        return enter() && ((depth <= usualNesting && longArrays.begin(stream.src_, textEnd)) ||
                           document.StartArray());
    }
    bool EndArray(SizeType elements) {
        --depth;
        return longArrays.isOpen() ? longArrays.finish() : document.EndArray(elements);
    }

    bool Null() { return longArrays.isOpen() ? longArrays.add(JsonValue()) : document.Null(); }
    bool Bool(bool value) { return add(value, &JsonDocument::Bool); }
    bool Int(int value) { return add(value, &JsonDocument::Int); }
    bool Uint(unsigned value) { return add(value, &JsonDocument::Uint); }
    bool Int64(std::int64_t value) { return add(value, &JsonDocument::Int64); }
    bool Uint64(std::uint64_t value) { return add(value, &JsonDocument::Uint64); }
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
    // Deeper arrays are not searched for long ones, so that no byte is searched many times.
    static constexpr int usualNesting = 8;

    bool enter() { return ++depth <= maxNesting; }

    template <typename Scalar, typename AddToDocument>
    bool add(Scalar value, AddToDocument addToDocument) {
        return longArrays.isOpen() ? longArrays.add(value) : (document.*addToDocument)(value);
    }

    JsonDocument& document;
    LongArrays longArrays;
    const JsonStream& stream;
    const char* const textEnd;
    int depth = 0;
    bool sawInfinity = false;
};

char* copyOf(const std::string& text, JsonAllocator& allocator) {
    auto* const copy = static_cast<char*>(allocator.Malloc(text.size() + 1));
    std::memcpy(copy, text.c_str(), text.size() + 1);
    return copy;
}

}  // namespace

void parseRequestText(const std::string& body, JsonDocument& document) {
    if (holdsUncountableNumber(body)) {
        throw std::bad_alloc();
    }
    const std::optional<std::string> guardedBody = withSafeExponents(body.c_str());
    const std::string& wholeText = guardedBody ? *guardedBody : body;
    char* const text = copyOf(wholeText, document.GetAllocator());
    JsonStream stream(text);
    JsonReader reader;
    GuardedDocument handler(document, stream, text + wholeText.size());
    auto parse = [&](JsonDocument&) {
        return !reader.Parse<rapidjson::kParseInsituFlag>(stream, handler).IsError();
    };
    document.Populate(parse);
    if (!reader.HasParseError()) {
        handler.finish();
        return;
    }
    const auto code =
        handler.numberTooBig() ? rapidjson::kParseErrorNumberTooBig : reader.GetParseErrorCode();
    BasicError error(qierr::codes::parseError, QITRMC_HERE);
    addUsageUInt32(
        addUsageString(error.details(), "kUsageTypeDetails", rapidjson::GetParseError_En(code)),
        "kUsageTypeOffset", static_cast<std::uint32_t>(reader.GetErrorOffset()));
    throw error;
}

}  // namespace nQITRMCWEBSVC100
