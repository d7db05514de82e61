#include "qitrmcwebsvc/compactJson.h"

#include <algorithm>
#include <cmath>
#include <cstring>
#include <limits>
#include <new>
#include <utility>

namespace nQITRMCWEBSVC100 {
namespace {

using Length = rapidjson::SizeType;

// The JSON library reserves six bytes for each byte of a text plus two for the quotes, and computes
// that size in 32 bits.
constexpr Length longestText = (std::numeric_limits<Length>::max() - 2) / 6;

// ---- The output ---------------------------------------------------------------------------------

// The text that the writer produces. The JSON library's own buffer would have to be copied.
class TextStream {
  public:
    using Ch = char;

    TextStream() : text(1024, '\0') { continueAt(0); }
    TextStream(const TextStream&) = delete;
    TextStream& operator=(const TextStream&) = delete;

    void reserve(std::size_t count) {
        if (count > static_cast<std::size_t>(end - at)) {
            grow(count);
        }
    }
    void putReserved(char c) { *at++ = c; }
    void Put(char c) {
        reserve(1);
        putReserved(c);
    }
    void Flush() {}

    // Where to write what was reserved, before the call of advance.
    char* position() { return at; }
    void advance(std::size_t count) { at += count; }

    std::string take() {
        text.resize(used());
        return std::move(text);
    }

  private:
    std::size_t used() const { return static_cast<std::size_t>(at - text.data()); }

    void continueAt(std::size_t position) {
        at = text.data() + position;
        end = text.data() + text.size();
    }

    void grow(std::size_t count) {
        const std::size_t position = used();
        text.resize(std::max(position + count, 2 * text.size()));
        continueAt(position);
    }

    std::string text;
    char* at;
    char* end;
};

// The functions of the JSON library for the output of several bytes.
void PutReserve(TextStream& stream, std::size_t count) {
    stream.reserve(count);
}
void PutUnsafe(TextStream& stream, char c) {
    stream.putReserved(c);
}

// ---- Bytes --------------------------------------------------------------------------------------

// In an array, a text at this address says that the next text contains the bytes of the array.
constexpr char bytesMark[] = "bytes";

// A byte as a number with a comma. `text` is not terminated.
struct PrintedByte {
    char text[4];
    std::uint8_t length;
};

struct PrintedBytes {
    PrintedByte of[256];
};

constexpr PrintedBytes printedBytes = [] {
    PrintedBytes table{};
    for (int byte = 0; byte < 256; ++byte) {
        PrintedByte& printed = table.of[byte];
        for (int power = byte < 10 ? 1 : byte < 100 ? 10 : 100; power != 0; power /= 10) {
            printed.text[printed.length++] = static_cast<char>('0' + byte / power % 10);
        }
        printed.text[printed.length++] = ',';
    }
    return table;
}();

std::size_t printedLength(const std::uint8_t* bytes, std::size_t count) {
    std::size_t length = 2 * count;
    for (std::size_t i = 0; i < count; ++i) {
        length += (bytes[i] >= 10) + (bytes[i] >= 100);
    }
    return length;
}

// Without a comma at the end.
void printBytes(const std::uint8_t* bytes, std::size_t count, TextStream& stream) {
    // With room for the last number, which is written with its whole width, and for what usually
    // follows, so that a long text need not grow once more.
    stream.reserve(printedLength(bytes, count) + 256);
    char* const begin = stream.position();
    char* end = begin;
    for (std::size_t i = 0; i < count; ++i) {
        const PrintedByte& printed = printedBytes.of[bytes[i]];
        std::memcpy(end, printed.text, sizeof printed.text);
        end += printed.length;
    }
    stream.advance(static_cast<std::size_t>(end - begin) - 1);
}

// ---- The writer ---------------------------------------------------------------------------------

using Writer = rapidjson::Writer<TextStream, JsonEncoding, JsonEncoding, ThrowingAllocator>;

// Handles the values that the JSON library cannot write: prints an infinity or NaN as null, prints
// the bytes of a byteArray, and throws std::bad_alloc for a text that is too long.
class GuardedWriter : public Writer {
  public:
    using Writer::Writer;

    bool String(const char* text, Length length, bool copy) {
        if (text == bytesMark) {
            bytesFollow = true;
            return true;
        }
        if (bytesFollow) {
            bytesFollow = false;
            printBytes(reinterpret_cast<const std::uint8_t*>(text), length, *os_);
            return true;
        }
        expectRoomFor(length);
        return Writer::String(text, length, copy);
    }
    bool Key(const char* text, Length length, bool copy) {
        expectRoomFor(length);
        return Writer::Key(text, length, copy);
    }
    bool Double(double value) { return std::isfinite(value) ? Writer::Double(value) : Null(); }

  private:
    static void expectRoomFor(Length length) {
        if (length > longestText) {
            throw std::bad_alloc();
        }
    }

    bool bytesFollow = false;
};

}  // namespace

std::string compactJson(const JsonValue& value) {
    TextStream text;
    GuardedWriter writer(text);
    value.Accept(writer);
    return text.take();
}

JsonValue byteArray(const std::uint8_t* bytes, std::uint32_t count, JsonAllocator& allocator) {
    JsonValue array(rapidjson::kArrayType);
    if (count != 0) {
        void* const copy = std::memcpy(allocator.Malloc(count), bytes, count);
        array.Reserve(2, allocator);
        array.PushBack(JsonValue(rapidjson::StringRef(bytesMark)), allocator);
        array.PushBack(JsonValue(rapidjson::StringRef(static_cast<const char*>(copy), count)),
                       allocator);
    }
    return array;
}

}  // namespace nQITRMCWEBSVC100
