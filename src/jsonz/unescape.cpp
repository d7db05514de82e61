#include <cstring>

#include "jsonz/jsonz.h"
#include "jsonz/scan.h"

namespace {

constexpr std::uint32_t fault = 0xFFFFFFFF;

// Decodes a string in steps of one plain byte or one escape sequence.
class Decoder {
  public:
    Decoder(const char* text, std::size_t length) : p(text), end(text + length) {}

    bool atEnd() const { return p == end; }

    // Writes the bytes of the next step, at most 4. Returns their number, or 0 for an invalid one.
    std::size_t step(char* bytes) {
        if (*p != '\\') {
            *bytes = *p++;
            return 1;
        }
        ++p;
        if (atEnd()) {
            return 0;
        }
        return *p == 'u' ? encode(codePoint(), bytes) : simpleEscape(bytes);
    }

  private:
    std::size_t simpleEscape(char* bytes) {
        static constexpr char letters[] = "\"/\\bfnrt";
        static constexpr char meanings[] = "\"/\\\b\f\n\r\t";
        const void* letter = std::memchr(letters, *p, sizeof letters - 1);
        if (letter == nullptr) {
            return 0;
        }
        *bytes = meanings[static_cast<const char*>(letter) - letters];
        ++p;
        return 1;
    }

    // Reads the code point that begins at the letter u: one code unit or a surrogate pair.
    std::uint32_t codePoint() {
        const std::uint32_t high = unit();
        if (high == fault || high < 0xD800 || high > 0xDFFF) {
            return high;
        }
        if (high > 0xDBFF || end - p < 2 || p[0] != '\\' || p[1] != 'u') {
            return fault;
        }
        ++p;
        const std::uint32_t low = unit();
        if (low < 0xDC00 || low > 0xDFFF) {
            return fault;
        }
        return 0x10000 + ((high - 0xD800) << 10) + (low - 0xDC00);
    }

    // Reads one code unit: the letter u and four hexadecimal digits.
    std::uint32_t unit() {
        if (end - p < 5) {
            return fault;
        }
        ++p;
        std::uint32_t result = 0;
        for (int i = 0; i < 4; ++i, ++p) {
            const int digit = jsonz::hexDigit(*p);
            if (digit < 0) {
                return fault;
            }
            result = result << 4 | static_cast<std::uint32_t>(digit);
        }
        return result;
    }

    static char continuation(std::uint32_t bits) { return static_cast<char>(0x80 | (bits & 0x3F)); }

    static std::size_t encode(std::uint32_t codePoint, char* bytes) {
        if (codePoint >= 0x200000) {
            return 0;
        }
        if (codePoint < 0x80) {
            bytes[0] = static_cast<char>(codePoint);
            return 1;
        }
        if (codePoint < 0x800) {
            bytes[0] = static_cast<char>(0xC0 | codePoint >> 6);
            bytes[1] = continuation(codePoint);
            return 2;
        }
        if (codePoint < 0x10000) {
            bytes[0] = static_cast<char>(0xE0 | codePoint >> 12);
            bytes[1] = continuation(codePoint >> 6);
            bytes[2] = continuation(codePoint);
            return 3;
        }
        bytes[0] = static_cast<char>(0xF0 | codePoint >> 18);
        bytes[1] = continuation(codePoint >> 12);
        bytes[2] = continuation(codePoint >> 6);
        bytes[3] = continuation(codePoint);
        return 4;
    }

    const char* p;
    const char* const end;
};

}  // namespace

char* jsonz_unescape(const char* text, std::size_t length, char* output) {
    Decoder decoder(text, length);
    *output = '\0';
    while (!decoder.atEnd()) {
        char bytes[4];
        const std::size_t count = decoder.step(bytes);
        if (count == 0) {
            return nullptr;
        }
        std::memcpy(output, bytes, count);
        output += count;
        *output = '\0';
    }
    return output;
}

bool jsonz_equals(const char* text, std::size_t length, const char* plain) {
    Decoder decoder(text, length);
    while (!decoder.atEnd()) {
        char bytes[4];
        const std::size_t count = decoder.step(bytes);
        if (count == 0 || *bytes == '\0' || std::strncmp(plain, bytes, count) != 0) {
            return false;
        }
        plain += count;
    }
    return *plain == '\0';
}
