#include "host/EntryName.h"

#include <gmock/gmock.h>

namespace {

using host::entryNameOfPath;
using testing::ElementsAre;
using testing::Optional;

using Name = std::vector<std::uint32_t>;

TEST(EntryName, IsTheSegmentBelowTheServicesName) {
    EXPECT_THAT(entryNameOfPath("/qitrmc/Call"), Optional(ElementsAre('C', 'a', 'l', 'l')));
}

TEST(EntryName, IsAbsentFromEveryOtherPath) {
    for (const char* path :
         {"", "/", "*", "/qitrmc", "/qitrmc/", "/Qitrmc/Call", "qitrmc/Call", "//qitrmc/Call",
          "/qitrmc/Call/", "/qitrmc//Call", "/qitrmc/a/b", "/other/Call", "/%71itrmc/Call"}) {
        EXPECT_EQ(entryNameOfPath(path), std::nullopt) << path;
    }
}

TEST(EntryName, IsFoundInTheAbsoluteFormOfATarget) {
    EXPECT_THAT(entryNameOfPath("http://host:80/qitrmc/C"), Optional(ElementsAre('C')));
    EXPECT_EQ(entryNameOfPath("http://host"), std::nullopt);
    EXPECT_EQ(entryNameOfPath("http://qitrmc/C"), std::nullopt);
    EXPECT_THAT(entryNameOfPath("/qitrmc/a:b"), Optional(ElementsAre('a', ':', 'b')));
}

TEST(EntryName, DecodesPercentEscapesInBothCases) {
    EXPECT_THAT(entryNameOfPath("/qitrmc/%43%6c%6C"), Optional(ElementsAre('C', 'l', 'l')));
}

TEST(EntryName, MayHoldASlashOrANulThatIsEscaped) {
    EXPECT_THAT(entryNameOfPath("/qitrmc/a%2Fb%00"), Optional(ElementsAre('a', '/', 'b', 0)));
}

TEST(EntryName, KeepsAPercentSignThatDoesNotBeginAnEscape) {
    EXPECT_THAT(entryNameOfPath("/qitrmc/%"), Optional(ElementsAre('%')));
    EXPECT_THAT(entryNameOfPath("/qitrmc/%4"), Optional(ElementsAre('%', '4')));
    EXPECT_THAT(entryNameOfPath("/qitrmc/%4G%+1"),
                Optional(ElementsAre('%', '4', 'G', '%', '+', '1')));
}

TEST(EntryName, DecodesUtf8ToOneNumberForEachCharacter) {
    EXPECT_THAT(entryNameOfPath("/qitrmc/%C3%A9%E2%82%AC%F0%9F%98%80"),
                Optional(ElementsAre(0xE9, 0x20AC, 0x1F600)));
    EXPECT_THAT(entryNameOfPath("/qitrmc/\xC3\xA9"), Optional(ElementsAre(0xE9)));
}

TEST(EntryName, ContainsTheReplacementCharacterForEachByteThatIsNotUtf8) {
    EXPECT_THAT(entryNameOfPath("/qitrmc/a%FFb"), Optional(ElementsAre('a', 0xFFFD, 'b')));
    EXPECT_THAT(entryNameOfPath("/qitrmc/%C3"), Optional(ElementsAre(0xFFFD)));
    EXPECT_THAT(entryNameOfPath("/qitrmc/%ED%A0%80"),
                Optional(ElementsAre(0xFFFD, 0xFFFD, 0xFFFD)));
}

TEST(Entry, ReturnsItsNameThroughTheFourthOperation) {
    const Name name = {'C', 0x1F600};
    const host::Entry entry(name);
    const auto fourth =
        reinterpret_cast<ws_WideString (*const*)(const ws_Entry*)>(entry.operations)[3];
    const ws_WideString text = fourth(&entry);
    EXPECT_THAT(Name(text.begin, text.end), ElementsAre('C', 0x1F600));
}

}  // namespace
