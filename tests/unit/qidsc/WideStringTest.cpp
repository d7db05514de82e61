#include "qi/dsc/WideString.h"

#include <gtest/gtest.h>

#include <vector>

#include "qi/dsc/exceptions.h"

using qi::dsc::WideString;

namespace {

std::vector<std::uint32_t> charactersOf(const WideString& string) {
    return std::vector<std::uint32_t>(string.begin(), string.end());
}

bool equal(const std::vector<std::uint32_t>& characters, const char* text) {
    const WideString wide(characters.data(), characters.data() + characters.size());
    const bool result = equalsIgnoringCase(wide, WideString(text));
    EXPECT_EQ(equalsIgnoringCase(WideString(text), wide), result);
    return result;
}

// A range of addresses that is never read.
WideString fromRange(std::uintptr_t begin, std::uintptr_t end) {
    return WideString(reinterpret_cast<const std::uint32_t*>(begin),
                      reinterpret_cast<const std::uint32_t*>(end));
}

std::int32_t lineOfRefusal(std::uintptr_t begin, std::uintptr_t end) {
    try {
        fromRange(begin, end);
    } catch (const qi::dsc::exception::OutOfRange& error) {
        return error.line;
    }
    return 0;
}

}  // namespace

TEST(WideString, CopiesItsCharacters) {
    std::vector<std::uint32_t> source{'C', 0, 0x10FFFF};
    const WideString copy(source.data(), source.data() + source.size());
    source[0] = 'x';
    EXPECT_EQ(charactersOf(copy), (std::vector<std::uint32_t>{'C', 0, 0x10FFFF}));
    EXPECT_EQ(*copy.end(), 0u);
}

TEST(WideString, WidensAsciiText) {
    EXPECT_EQ(charactersOf(WideString("Call")), (std::vector<std::uint32_t>{'C', 'a', 'l', 'l'}));
}

TEST(WideString, NullReadsAsEmpty) {
    EXPECT_TRUE(charactersOf(WideString(nullptr, nullptr)).empty());
    EXPECT_TRUE(charactersOf(WideString(nullptr)).empty());
    EXPECT_TRUE(charactersOf(WideString("")).empty());
    EXPECT_TRUE(equalsIgnoringCase(WideString(nullptr), WideString("")));
}

TEST(WideString, ComparesWithoutRegardToCase) {
    EXPECT_TRUE(equal({'C', 'a', 'l', 'l'}, "Call"));
    EXPECT_TRUE(equal({'c', 'A', 'L', 'l'}, "Call"));
    EXPECT_FALSE(equal({'C', 'a', 'l'}, "Call"));
    EXPECT_FALSE(equal({'C', 'a', 'l', 'l', 's'}, "Call"));
    EXPECT_FALSE(equal({'C', 'a', 'l', 'l', 0}, "Call"));
    EXPECT_FALSE(equal({'C', 'a', 'l', 'k'}, "Call"));
    EXPECT_FALSE(equal({}, "Call"));
    EXPECT_FALSE(equal({'[', '{'}, "{["));
}

TEST(WideString, ComparesWholeCharacters) {
    EXPECT_FALSE(equal({'C' + 0x100, 'a', 'l', 'l'}, "Call"));
    EXPECT_FALSE(equal({'C' + 0x1000000, 'a', 'l', 'l'}, "Call"));
    EXPECT_FALSE(equal({0xFFFFFFFF, 'a', 'l', 'l'}, "Call"));
}

TEST(WideString, RefusesSizesBeyond32Bits) {
    if (sizeof(void*) < 8) {
        GTEST_SKIP() << "such strings do not fit into the address space";
    }
    constexpr std::uintptr_t base = 0x1000;
    const auto endAfter = [](std::uint64_t characters) {
        return static_cast<std::uintptr_t>(base + 4 * characters);
    };
    EXPECT_EQ(lineOfRefusal(base, endAfter(0x3FFFFFFF)), 163);
    EXPECT_EQ(lineOfRefusal(base, endAfter(0xFFFFFFFE)), 163);
    EXPECT_EQ(lineOfRefusal(base, endAfter(0xFFFFFFFF)), 125);
    EXPECT_EQ(lineOfRefusal(base, endAfter(0x100000000)), 125);
}

TEST(WideString, RefusesAnEndBeforeItsBegin) {
    // Four characters too few are 0xFFFFFFFC in 32 bits: a length that is allowed, of too many
    // bytes.
    EXPECT_EQ(lineOfRefusal(0x1010, 0x1000), sizeof(void*) < 8 ? 163 : 125);
}
