#include "qierr/Writer.h"

#include <cinttypes>
#include <cstdio>
#include <cstring>

static_assert(sizeof(qierr_Writer) == 3 * sizeof(void*));

namespace {

// The limit of a member's size. Sizes are computed in 64 bits, since escaping can make a text six
// times as long.
constexpr std::uint64_t largestMember = 0x7FFFFFFD;

bool isBlank(char c) {
    return c == ' ' || c == '\t' || c == '\r' || c == '\n';
}

bool isOpening(char c) {
    return c == '{' || c == '[';
}

// ---- Escaping -----------------------------------------------------------------------------------

// The letter of a character's two-character escape sequence, or 0 if it has none.
constexpr char escapeLetter(char c) {
    switch (c) {
        case '\b':
            return 'b';
        case '\t':
            return 't';
        case '\n':
            return 'n';
        case '\f':
            return 'f';
        case '\r':
            return 'r';
        case '"':
        case '\\':
            return c;
        default:
            return 0;
    }
}

// How many bytes each byte becomes.
struct EscapedSizes {
    unsigned char of[256];
};

constexpr EscapedSizes escapedSizes = [] {
    EscapedSizes sizes{};
    for (int byte = 0; byte < 256; ++byte) {
        const bool isShort = escapeLetter(static_cast<char>(byte)) != 0;
        const bool isControl = byte < 0x20 || byte == 0x7F;
        sizes.of[byte] = isShort ? 2 : isControl ? 6 : 1;
    }
    return sizes;
}();

unsigned escapedSize(char c) {
    return escapedSizes.of[static_cast<unsigned char>(c)];
}

std::uint64_t escapedLength(const char* text) {
    std::uint64_t length = 0;
    for (; *text != '\0'; ++text) {
        length += escapedSize(*text);
    }
    return length;
}

char* writeEscaped(char* at, const char* text) {
    for (; *text != '\0'; ++text) {
        const unsigned size = escapedSize(*text);
        if (size == 1) {
            *at = *text;
        } else if (size == 2) {
            at[0] = '\\';
            at[1] = escapeLetter(*text);
        } else {
            char sequence[8];
            std::snprintf(sequence, sizeof sequence, "\\u%04x", *text & 0xFFu);
            std::memcpy(at, sequence, 6);
        }
        at += size;
    }
    return at;
}

// ---- Insertion ----------------------------------------------------------------------------------

// A member of an object, or an element of an array.
struct Member {
    const char* key;    // null for an element
    const char* value;  // JSON text, or the unescaped text of a string
    bool isString;

    std::uint64_t size() const {
        const std::uint64_t keySize = key != nullptr ? escapedLength(key) + 3 : 0;
        return keySize + (isString ? escapedLength(value) + 2 : std::strlen(value));
    }

    // Returns the position after the last byte written.
    char* write(char* at) const {
        if (key != nullptr) {
            at = writeString(at, key);
            *at++ = ':';
        }
        if (isString) {
            return writeString(at, value);
        }
        const std::size_t length = std::strlen(value);
        std::memcpy(at, value, length);
        return at + length;
    }

  private:
    static char* writeString(char* at, const char* text) {
        *at++ = '"';
        at = writeEscaped(at, text);
        *at++ = '"';
        return at;
    }
};

// Whether a member that is inserted at `pos` needs a comma: unless the container is empty.
bool needsComma(const char* pos) {
    const char* neighbour = pos;
    if (isOpening(*pos)) {
        do {
            ++neighbour;
        } while (isBlank(*neighbour));
        return *neighbour != (*pos == '{' ? '}' : ']');
    }
    if (*pos != '}' && *pos != ']') {
        return true;
    }
    do {
        --neighbour;
    } while (isBlank(*neighbour));
    return *neighbour != (*pos == '}' ? '{' : '[');
}

// Whether `room` zero bytes lie between the NUL of the text and the end marker of the buffer.
bool hasRoom(const char* nul, std::uint64_t room) {
    for (std::uint64_t i = 1; i <= room; ++i) {
        if (nul[i] != '\0') {
            return false;
        }
    }
    return true;
}

// Moves the rest of the text to make a gap of `size` bytes for a member, and writes a comma beside
// the gap if one is needed. Returns the start of the gap, or null if there is not enough space;
// space for a comma is always required.
char* openGap(char* pos, std::uint64_t size) {
    const bool atStart = isOpening(*pos);
    const bool comma = needsComma(pos);
    char* tail = atStart ? pos + 1 : pos;
    const std::size_t tailLength = std::strlen(tail);
    if (!hasRoom(tail + tailLength, size + 1)) {
        return nullptr;
    }
    const std::size_t gap = static_cast<std::size_t>(size) + (comma ? 1 : 0);
    std::memmove(tail + gap, tail, tailLength + 1);
    if (!comma) {
        return tail;
    }
    if (atStart) {
        tail[size] = ',';
        return tail;
    }
    *tail = ',';
    return tail + 1;
}

// Inserts a member. The returned writer is positioned `back` bytes before the end of the member.
qierr_Writer insert(qierr_Writer writer, const Member& member, int back) {
    if (writer.pos == nullptr) {
        return writer;
    }
    const std::uint64_t size = member.size();
    // Nothing can be inserted after the outermost container.
    if (size > largestMember || *writer.pos == '\0') {
        writer.pos = nullptr;
    }
    while (writer.pos != nullptr) {
        if (char* gap = openGap(writer.pos, size)) {
            writer.pos = member.write(gap) - back;
            break;
        }
        writer.pos = writer.grow(writer.pos, writer.context);
    }
    return writer;
}

// Moves past the bracket that closes the current container.
qierr_Writer pass(qierr_Writer writer, char bracket) {
    if (writer.pos != nullptr) {
        writer.pos = *writer.pos == bracket ? writer.pos + 1 : nullptr;
    }
    return writer;
}

}  // namespace

qierr_Writer qierr_Writer_beginObject(qierr_Writer writer, const char* key) {
    return insert(writer, {key, "{}", false}, 1);
}

qierr_Writer qierr_Writer_endObject(qierr_Writer writer) {
    return pass(writer, '}');
}

qierr_Writer qierr_Writer_beginArray(qierr_Writer writer, const char* key) {
    return insert(writer, {key, "[]", false}, 1);
}

qierr_Writer qierr_Writer_endArray(qierr_Writer writer) {
    return pass(writer, ']');
}

qierr_Writer qierr_Writer_addString(qierr_Writer writer, const char* key, const char* value) {
    return insert(writer, {key, value != nullptr ? value : "", true}, 0);
}

qierr_Writer qierr_Writer_addInt(qierr_Writer writer, const char* key, std::int32_t value) {
    char number[64];
    std::snprintf(number, sizeof number, "%" PRIi32, value);
    return insert(writer, {key, number, false}, 0);
}

qierr_Writer qierr_Writer_addUInt(qierr_Writer writer, const char* key, std::uint32_t value) {
    char number[64];
    std::snprintf(number, sizeof number, "%" PRIu32, value);
    return insert(writer, {key, number, false}, 0);
}
