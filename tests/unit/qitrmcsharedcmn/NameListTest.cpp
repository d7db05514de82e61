#include <random>

#include "Refusal.h"

using namespace nQITRMCSHAREDCMN100;

namespace {

using shared_test::path;
using shared_test::plain;

using Names = std::vector<std::string>;

}  // namespace

TEST(ExpandNames, ExpandsRanges) {
    EXPECT_EQ(expandNames("Mod1/ch0:2,Mod2/ch7", path),
              (Names{"Mod1/ch0", "Mod1/ch1", "Mod1/ch2", "Mod2/ch7"}));
    EXPECT_EQ(expandNames("Mod1/ch03", path), (Names{"Mod1/ch3"}));
    EXPECT_EQ(expandNames("Mod03", plain), (Names{"Mod3"}));
    EXPECT_EQ(expandNames("Mod03:04", plain), (Names{"Mod3", "Mod4"}));
    EXPECT_EQ(expandNames("12:14", plain), (Names{"12", "13", "14"}));
}

TEST(ExpandNames, DoesNotChangeDeviceNames) {
    EXPECT_EQ(expandNames("Mod1,Mod2", path), (Names{"Mod1", "Mod2"}));
    EXPECT_EQ(expandNames("Mod03,Mod1:3", path), (Names{"Mod03", "Mod1:3"}));
}

TEST(ExpandNames, KeepsEmptyPartsAndBlanks) {
    EXPECT_EQ(expandNames("", path), (Names{""}));
    EXPECT_EQ(expandNames(",", path), (Names{"", ""}));
    EXPECT_EQ(expandNames(",Mod1,,", path), (Names{"", "Mod1", "", ""}));
    EXPECT_EQ(expandNames(" Mod1 , Mod2", path), (Names{" Mod1 ", " Mod2"}));
}

TEST(ExpandNames, KeepsOrderAndRepeats) {
    EXPECT_EQ(expandNames("a/2,a/1,a/1:2", path), (Names{"a/2", "a/1", "a/1", "a/2"}));
}

TEST(ExpandNames, ReachesTheLargestNumber) {
    EXPECT_EQ(expandNames("a/4294967294:4294967295", path),
              (Names{"a/4294967294", "a/4294967295"}));
}

TEST(ExpandNames, RefusesTheListForOneBadName) {
    shared_test::expectRefused("a/4:1", [] { expandNames("a/1,a/4:1,a/5:2", path); });
}

TEST(CompressNames, JoinsConsecutiveNumbers) {
    EXPECT_EQ(compressNames({"Mod1/ch0", "Mod1/ch1", "Mod1/ch2"}, path), "Mod1/ch0:2");
    EXPECT_EQ(compressNames({"Mod1", "Mod2", "Mod3", "Mod7"}, plain), "Mod1:3,Mod7");
    EXPECT_EQ(compressNames({"a/1", "a/2", "b/3", "b/4", "a/3"}, path), "a/1:2,b/3:4,a/3");
    EXPECT_EQ(compressNames({"a/2", "a/1", "a/1", "a/2"}, path), "a/2,a/1,a/1:2");
}

TEST(CompressNames, DoesNotChangeDeviceNames) {
    EXPECT_EQ(compressNames({"Mod1", "Mod2"}, path), "Mod1,Mod2");
    EXPECT_EQ(compressNames({"Mod03", "Mod1:3"}, path), "Mod03,Mod1:3");
}

TEST(CompressNames, EmptyListAndEmptyNames) {
    EXPECT_EQ(compressNames({}, path), "");
    EXPECT_EQ(compressNames({""}, path), "");
    EXPECT_EQ(compressNames({"", ""}, path), ",");
}

TEST(CompressNames, DropsLeadingZeros) {
    EXPECT_EQ(compressNames({"a/03", "a/004"}, path), "a/3:4");
}

TEST(CompressNames, RangeThatContinuesARunAddsOne) {
    EXPECT_EQ(compressNames({"a/1", "a/2:5"}, path), "a/1:2");
    EXPECT_EQ(compressNames({"a/0:2", "a/3:5", "a/4"}, path), "a/0:4");
    EXPECT_EQ(compressNames({"a/2:5"}, path), "a/2:5");
}

TEST(CompressNames, NameWithoutANumberDoesNotStartARun) {
    EXPECT_EQ(compressNames({"a/ch", "a/ch1", "a/ch2"}, path), "a/ch,a/ch1:2");
}

TEST(CompressNames, NumbersDoNotWrapAround) {
    EXPECT_EQ(compressNames({"a/4294967295", "a/0"}, path), "a/4294967295,a/0");
}

TEST(CompressNames, RefusesTheListForOneBadName) {
    shared_test::expectRefused("a/4:1", [] { compressNames({"a/1", "a/4:1"}, path); });
}

TEST(NameLists, CompressedNamesExpandToTheSameNames) {
    std::mt19937 random(31);
    for (int round = 0; round < 2000; ++round) {
        Names names;
        std::uint32_t number = 0;
        for (unsigned count = random() % 30 + 1; count > 0; --count) {
            number = random() % 4 == 0 ? random() % 2000 : number + 1;
            const char* prefixes[] = {"a/ch", "a/ch", "a/ch", "b/"};
            names.push_back(prefixes[random() % 4] + std::to_string(number));
        }
        EXPECT_EQ(expandNames(compressNames(names, path), path), names);
    }
}

TEST(NameLists, TheTimeGrowsLinearlyWithTheText) {
    const std::string commas(1000000, ',');
    const Names parts = expandNames(commas, path);
    ASSERT_EQ(parts.size(), 1000001u);
    EXPECT_EQ(compressNames(parts, path), commas);
    const std::string digits = "a/" + std::string(1000000, '0') + "7";
    EXPECT_EQ(expandNames(digits, path), (Names{"a/7"}));
}
