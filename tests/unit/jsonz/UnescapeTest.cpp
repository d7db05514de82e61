#include <cstring>

#include "Reading.h"

namespace {

struct Decoded {
    explicit Decoded(const std::string& text) {
        std::string buffer(text.size() + 1, '?');
        const char* end = jsonz_unescape(text.data(), text.size(), &buffer[0]);
        complete = end != nullptr;
        bytes.assign(buffer.data(), complete ? static_cast<std::size_t>(end - buffer.data())
                                             : std::strlen(buffer.c_str()));
        terminated = buffer[bytes.size()] == '\0';
    }

    bool complete;
    bool terminated;
    std::string bytes;
};

void expectDecoded(const std::string& text, const std::string& bytes) {
    SCOPED_TRACE(text);
    const Decoded decoded(text);
    EXPECT_TRUE(decoded.complete);
    EXPECT_TRUE(decoded.terminated);
    EXPECT_EQ(decoded.bytes, bytes);
}

void expectFaultAfter(const std::string& text, const std::string& bytes) {
    SCOPED_TRACE(text);
    const Decoded decoded(text);
    EXPECT_FALSE(decoded.complete);
    EXPECT_EQ(decoded.bytes, bytes);
}

}  // namespace

TEST(JsonzUnescape, CopiesPlainBytes) {
    expectDecoded("", "");
    expectDecoded("plain \xc3\xa9 \x01", "plain \xc3\xa9 \x01");
}

TEST(JsonzUnescape, ResolvesLetterEscapes) {
    expectDecoded(R"(\"\/\\\b\f\n\r\t)", "\"/\\\b\f\n\r\t");
}

TEST(JsonzUnescape, EncodesCodePointsOfEachSize) {
    expectDecoded("\\u0041", "A");
    expectDecoded("\\u007f", "\x7f");
    expectDecoded("\\u0080", "\xc2\x80");
    expectDecoded("\\u07FF", "\xdf\xbf");
    expectDecoded("\\u0800", "\xe0\xa0\x80");
    expectDecoded("\\ud7ff", "\xed\x9f\xbf");
    expectDecoded("\\ue000", "\xee\x80\x80");
    expectDecoded("\\uffff", "\xef\xbf\xbf");
    expectDecoded("\\ud800\\udc00", "\xf0\x90\x80\x80");
    expectDecoded("\\ud83d\\ude00", "\xf0\x9f\x98\x80");
    expectDecoded("\\uDBFF\\uDFFF", "\xf4\x8f\xbf\xbf");
    expectDecoded("a\\u0000b", std::string("a\0b", 3));
}

TEST(JsonzUnescape, StopsAtALoneSurrogate) {
    expectFaultAfter("ab\\ud83d", "ab");
    expectFaultAfter("ab\\ud83dxx\\ude00", "ab");
    expectFaultAfter("ab\\ud83d\\u0041", "ab");
    expectFaultAfter("ab\\ud83d\\n", "ab");
    expectFaultAfter("ab\\ud83d\\ud83d", "ab");
    expectFaultAfter("ab\\ude00c", "ab");
}

TEST(JsonzUnescape, ALowSurrogateDoesNotBeginAPair) {
    expectFaultAfter("ab\\ude00\\ude00", "ab");
    expectFaultAfter("ab\\udc00\\udc00", "ab");
    expectFaultAfter("ab\\udfff\\udc01c", "ab");
}

TEST(JsonzUnescape, AHighSurrogateBeforeACharacterBeyondTheSurrogatesIsAlone) {
    expectFaultAfter("ab\\ud800\\ue000", "ab");
    expectFaultAfter("ab\\ud800\\uffff", "ab");
    expectFaultAfter("ab\\udbff\\udbff", "ab");
}

TEST(JsonzUnescape, StopsAtATruncatedOrUnknownEscape) {
    expectFaultAfter("a\\", "a");
    expectFaultAfter("a\\x", "a");
    expectFaultAfter("a\\u12", "a");
    expectFaultAfter("a\\u12g4", "a");
    expectFaultAfter("a\\ud83d\\u", "a");
    expectFaultAfter("a\\ud83d\\ude0", "a");
}

TEST(JsonzUnescape, EqualsComparesDecodedBytes) {
    EXPECT_TRUE(jsonz_equals("", 0, ""));
    EXPECT_TRUE(jsonz_equals("ab\"", 2, "ab"));
    EXPECT_TRUE(jsonz_equals("a\\u0062", 7, "ab"));
    EXPECT_FALSE(jsonz_equals("ab", 2, "abc"));
    EXPECT_FALSE(jsonz_equals("abc", 3, "ab"));
    EXPECT_FALSE(jsonz_equals("a\\u0000", 7, "a"));
    EXPECT_FALSE(jsonz_equals("a\\", 2, "a"));
}
