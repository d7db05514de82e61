#include "Refusal.h"

using namespace nQITRMCSHAREDCMN100;

namespace {

bool isValid(const std::string& text) {
    try {
        EXPECT_EQ(&checkUtf8(text), &text);
        return true;
    } catch (const BasicError& error) {
        EXPECT_EQ(error.status()->code, -250832);
        EXPECT_EQ(std::string(error.what()).find("translator"), std::string::npos);
        return false;
    }
}

char lead(std::uint32_t mark, std::uint32_t bits) {
    return static_cast<char>(mark | bits);
}

char tail(std::uint32_t bits) {
    return static_cast<char>(0x80 | (bits & 0x3F));
}

// A code point encoded in the given number of bytes, whether that is the correct number or not.
std::string encoded(std::uint32_t point, int bytes) {
    switch (bytes) {
        case 1:
            return {static_cast<char>(point)};
        case 2:
            return {lead(0xC0, point >> 6), tail(point)};
        case 3:
            return {lead(0xE0, point >> 12), tail(point >> 6), tail(point)};
        default:
            return {lead(0xF0, point >> 18), tail(point >> 12), tail(point >> 6), tail(point)};
    }
}

}  // namespace

TEST(CheckUtf8, AcceptsEachScalarValueInItsShortestForm) {
    const auto bytesOf = [](std::uint32_t p) {
        return p < 0x80 ? 1 : p < 0x800 ? 2 : p < 0x10000 ? 3 : 4;
    };
    std::string all;
    for (std::uint32_t point = 0; point <= 0x10FFFF; ++point) {
        if (point < 0xD800 || point > 0xDFFF) {
            all += encoded(point, bytesOf(point));
        }
    }
    EXPECT_TRUE(isValid(all));
    EXPECT_TRUE(isValid(""));
    EXPECT_TRUE(isValid(std::string("a\0b", 3)));
}

TEST(CheckUtf8, RefusesSurrogates) {
    for (std::uint32_t point = 0xD800; point <= 0xDFFF; ++point) {
        EXPECT_FALSE(isValid(encoded(point, 3))) << point;
    }
}

TEST(CheckUtf8, RefusesLongForms) {
    for (std::uint32_t point = 0; point < 0x80; ++point) {
        EXPECT_FALSE(isValid(encoded(point, 2))) << point;
    }
    for (std::uint32_t point = 0; point < 0x800; ++point) {
        EXPECT_FALSE(isValid(encoded(point, 3))) << point;
    }
    for (std::uint32_t point = 0; point < 0x10000; point += 7) {
        EXPECT_FALSE(isValid(encoded(point, 4))) << point;
    }
}

TEST(CheckUtf8, RefusesValuesAboveTheLastCodePoint) {
    for (std::uint32_t point = 0x110000; point < 0x200000; point += 97) {
        EXPECT_FALSE(isValid(encoded(point, 4))) << point;
    }
}

TEST(CheckUtf8, RefusesBadLeadBytes) {
    for (unsigned byte = 0x80; byte <= 0xFF; ++byte) {
        SCOPED_TRACE(byte);
        const std::string lead(1, static_cast<char>(byte));
        EXPECT_FALSE(isValid(lead));
        EXPECT_FALSE(isValid(lead + "A"));
        const bool canLead = byte >= 0xC2 && byte <= 0xF4;
        if (!canLead) {
            EXPECT_FALSE(isValid(lead + "\xa0"));
            EXPECT_FALSE(isValid(lead + "\xa0\xa0"));
            EXPECT_FALSE(isValid(lead + "\xa0\xa0\xa0"));
        }
    }
}

TEST(CheckUtf8, RefusesMissingAndBadContinuationBytes) {
    for (const char* text : {"\xc3", "\xe2\x82", "\xf0\x9f\x98", "a\xc3", "\xc3g", "\xe2\x82g",
                             "\xe2g\xac", "\xf0\x9f\x98g", "\xf0\x9f\xc3\xa9", "\xc3\xc3\xa9"}) {
        EXPECT_FALSE(isValid(text)) << text;
    }
}

TEST(CheckUtf8, FaultAtTheEndOfALongTextIsFound) {
    EXPECT_FALSE(isValid(std::string(100000, 'a') + "\x80"));
}
