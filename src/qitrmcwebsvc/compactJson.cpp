#include "qitrmcwebsvc/compactJson.h"

#include <cmath>
#include <limits>
#include <new>

namespace nQITRMCWEBSVC100 {
namespace {

using Length = rapidjson::SizeType;

// The JSON library reserves six bytes for each byte of a text plus two for the quotes, and computes
// that size in 32 bits.
constexpr Length longestText = (std::numeric_limits<Length>::max() - 2) / 6;

// Handles the values that the JSON library cannot write: prints an infinity or NaN as null, and
// throws std::bad_alloc for a text that is too long.
class GuardedWriter : public JsonWriter {
  public:
    using JsonWriter::JsonWriter;

    bool String(const char* text, Length length, bool copy) {
        expectRoomFor(length);
        return JsonWriter::String(text, length, copy);
    }
    bool Key(const char* text, Length length, bool copy) {
        expectRoomFor(length);
        return JsonWriter::Key(text, length, copy);
    }
    bool Double(double value) { return std::isfinite(value) ? JsonWriter::Double(value) : Null(); }

  private:
    static void expectRoomFor(Length length) {
        if (length > longestText) {
            throw std::bad_alloc();
        }
    }
};

}  // namespace

std::string compactJson(const JsonValue& value) {
    JsonBuffer text;
    GuardedWriter writer(text);
    value.Accept(writer);
    return std::string(text.GetString(), text.GetSize());
}

}  // namespace nQITRMCWEBSVC100
