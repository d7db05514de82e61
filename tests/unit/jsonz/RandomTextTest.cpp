#include <memory>
#include <random>

#include "Reading.h"

// A straightforward recursive reader, with which the reader that does not recurse is compared. It
// returns whether a text is accepted and where the value ends.
namespace {

class Yardstick {
  public:
    static long end(const std::string& text) {
        Yardstick reader{text.c_str()};
        return reader.value() ? reader.p - text.c_str() : -1;
    }

  private:
    explicit Yardstick(const char* text) : p(text) {}

    void blanks() {
        while (*p == ' ') {
            ++p;
        }
    }

    bool take(char c) {
        if (*p != c) {
            return false;
        }
        ++p;
        return true;
    }

    bool string() {
        if (!take('"')) {
            return false;
        }
        while (*p != '"') {
            if (*p == '\\' && *++p != 'n' && *p != '"' && *p != '\\') {
                return false;
            }
            if (*p++ == '\0') {
                return false;
            }
        }
        return take('"');
    }

    bool rest(char closer, bool isObject) {
        blanks();
        if (take(closer)) {
            return true;
        }
        for (;;) {
            blanks();
            if (isObject && !(string() && (blanks(), take(':')))) {
                return false;
            }
            if (!value()) {
                return false;
            }
            blanks();
            if (take(closer)) {
                return true;
            }
            if (!take(',')) {
                return false;
            }
        }
    }

    bool value() {
        blanks();
        if (*p == '"') {
            return string();
        }
        if (take('[')) {
            return rest(']', false);
        }
        if (take('{')) {
            return rest('}', true);
        }
        if (!take('1')) {
            return false;
        }
        while (take('1')) {
        }
        return true;
    }

    const char* p;
};

}  // namespace

TEST(JsonzRandomText, AgreesWithARecursiveReader) {
    static const std::string pieces[] = {"[", "]",      "{",        "}",       ",",  "1",
                                         " ", "\"a\":", "\"n\"",    "\"\\n\"", "\\", "\"",
                                         ":", "[1,",    "{\"k\":1", "]]"};
    std::mt19937 random(20240611);
    int readable = 0;
    for (int round = 0; round < 300000; ++round) {
        std::string text;
        for (unsigned count = random() % 12 + 1; count > 0; --count) {
            text += pieces[random() % std::size(pieces)];
        }
        const long expected = Yardstick::end(text);
        readable += expected >= 0 ? 1 : 0;
        ASSERT_EQ(jsonz_test::Reading(text.c_str()).consumed, expected) << text;
    }
    EXPECT_GT(readable, 10000);
}

TEST(JsonzRandomText, StaysInsideAnyText) {
    std::mt19937 random(5);
    static const char alphabet[] = "[]{},:\"\\u0dD8en-+.tfrals \x01\x80\xff";
    for (int round = 0; round < 200000; ++round) {
        std::string text(random() % 24, ' ');
        for (char& c : text) {
            c = alphabet[random() % (sizeof alphabet - 1)];
        }
        // A block of exactly its size, so that a sanitizer detects a read past the NUL.
        const std::unique_ptr<char[]> exact(new char[text.size() + 1]);
        text.copy(exact.get(), text.size());
        exact[text.size()] = '\0';
        const char* begin = exact.get();
        const char* end = begin + text.size();
        jsonz_value value;
        const char* behind = jsonz_readValue(begin, &value);
        ASSERT_EQ(behind == nullptr, value.type == jsonz_typeFailure) << text;
        ASSERT_TRUE(behind == nullptr || (behind > begin && behind <= end)) << text;
        ASSERT_TRUE(value.position == nullptr || value.position <= end) << text;
        jsonz_findMember(begin, "u");
        jsonz_getInt(begin, 0);
        const std::unique_ptr<char[]> output(new char[text.size() + 1]);
        jsonz_unescape(begin, text.size(), output.get());
    }
}
