#pragma once

#include <cstddef>
#include <vector>

#include "qitrmcwebsvc/Json.h"

namespace nQITRMCWEBSVC100 {

// The long arrays of numbers in a text that is being parsed.
//
// The JSON library collects the elements of an array on a stack, which it copies as it grows, and
// then copies the array into the document. For a million numbers most of the time would go into the
// memory for that. Here such an array gets all of its memory at once, and the document a text in
// its place, until `place` replaces that.
class LongArrays {
  public:
    // The length of the text of an array, in bytes. The library's way costs shorter arrays little.
    static constexpr std::ptrdiff_t shortest = 4096;

    explicit LongArrays(JsonDocument& target) : document(target) {}

    // Begins an array if `text`, the text behind its opening bracket, has a long array of numbers,
    // literals or nothing else. Its elements are passed to `add` then, and its end to `finish`.
    bool begin(const char* text, const char* textEnd) {
        return textEnd - text >= shortest && beginFlat(text, textEnd);
    }
    bool isOpen() const { return open; }
    template <typename Scalar>
    bool add(Scalar scalar) {
        return add(JsonValue(scalar));
    }
    bool add(JsonValue&& scalar);
    bool finish();

    // Puts all arrays into the document, which is complete by now.
    void place() {
        if (!arrays.empty()) {
            placeIn(document);
        }
    }

  private:
    bool beginFlat(const char* text, const char* textEnd);
    void placeIn(JsonValue& value);

    JsonDocument& document;
    std::vector<JsonValue> arrays;
    bool open = false;
};

}  // namespace nQITRMCWEBSVC100
