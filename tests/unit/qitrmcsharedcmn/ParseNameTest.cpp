#include "Refusal.h"

using namespace nQITRMCSHAREDCMN100;

namespace {

using shared_test::path;
using shared_test::plain;

void expectNumbered(const std::string& name, NameKind kind, const std::string& prefix,
                    std::uint32_t start, std::uint32_t end) {
    SCOPED_TRACE(name);
    const ParsedName parsed = parseName(name, kind);
    EXPECT_EQ(parsed.prefix, prefix);
    EXPECT_EQ(parsed.start, start);
    EXPECT_EQ(parsed.end, end);
    EXPECT_TRUE(parsed.hasNumber);
}

void expectWhole(const std::string& name, NameKind kind) {
    SCOPED_TRACE(name);
    const ParsedName parsed = parseName(name, kind);
    EXPECT_EQ(parsed.prefix, name);
    EXPECT_FALSE(parsed.hasNumber);
}

void expectRefused(const std::string& name, NameKind kind) {
    shared_test::expectRefused(name, [&] { parseName(name, kind); });
}

}  // namespace

TEST(ParsePathName, NameWithoutASlashIsNotSplit) {
    for (const char* name : {"", "Mod1", "Mod03", "Mod1:3", "Mod1:", ":", "12", "12:14", "a:b:c"}) {
        expectWhole(name, path);
    }
}

TEST(ParsePathName, NumberIsAtTheEndOfTheLastPart) {
    expectNumbered("Mod1/ch0", path, "Mod1/ch", 0, 0);
    expectNumbered("Mod1/ch03", path, "Mod1/ch", 3, 3);
    expectNumbered("Mod1/12", path, "Mod1/", 12, 12);
    expectNumbered("/7", path, "/", 7, 7);
    expectWhole("Mod1/ch", path);
    expectWhole("Mod1/", path);
    expectWhole("1/", path);
}

TEST(ParsePathName, RangeIsAtTheEndToo) {
    expectNumbered("Mod1/ch0:2", path, "Mod1/ch", 0, 2);
    expectNumbered("Mod1/ch03:004", path, "Mod1/ch", 3, 4);
    expectNumbered("Mod1/ch5:5", path, "Mod1/ch", 5, 5);
    expectNumbered("Mod1/0:2", path, "Mod1/", 0, 2);
}

TEST(ParsePathName, RefusesMalformedRanges) {
    for (const char* name :
         {"Mod1/ch1:", "Mod1/ch:1", "Mod1/ch1:x", "Mod1/ch1:2x", "Mod1/ch1:2:3", "Mod1:2/ch0",
          "1:2/ch0", "12:/", ":/", "/:", "Mod1/ch1: 2", "Mod1/ch1:-2", "Mod1/ch1:+2"}) {
        expectRefused(name, path);
    }
}

TEST(ParsePathName, RefusesABackwardRange) {
    expectRefused("Mod1/ch4:1", path);
    expectNumbered("Mod1/ch4:4", path, "Mod1/ch", 4, 4);
}

TEST(ParsePathName, RangeHolds1024NamesAtMost) {
    expectNumbered("Mod1/ch1:1024", path, "Mod1/ch", 1, 1024);
    expectRefused("Mod1/ch1:1025", path);
    expectNumbered("Mod1/ch0:1023", path, "Mod1/ch", 0, 1023);
    expectRefused("Mod1/ch0:1024", path);
    expectRefused("Mod1/ch0:4294967295", path);
    expectNumbered("Mod1/ch4294966272:4294967295", path, "Mod1/ch", 4294966272u, 4294967295u);
}

TEST(ParsePathName, RefusesNumbersBeyond32Bits) {
    expectNumbered("a/4294967295", path, "a/", 4294967295u, 4294967295u);
    expectNumbered("a/00000000000000000000000000001", path, "a/", 1, 1);
    expectRefused("a/4294967296", path);
    expectRefused("a/99999999999999999999999999", path);
    expectRefused("a/4294967296:4294967297", path);
    expectRefused("a/1:4294967297", path);
}

TEST(ParsePathName, OtherKindsAreTreatedAsPaths) {
    expectWhole("Mod1", static_cast<NameKind>(2));
    expectNumbered("Mod1/ch0:2", static_cast<NameKind>(-1), "Mod1/ch", 0, 2);
    expectRefused("1:2/x", static_cast<NameKind>(2));
}

TEST(ParsePlainName, NumberIsAtTheEnd) {
    expectNumbered("Mod1", plain, "Mod", 1, 1);
    expectNumbered("Mod03", plain, "Mod", 3, 3);
    expectNumbered("12", plain, "", 12, 12);
    expectNumbered("a1b2", plain, "a1b", 2, 2);
    expectWhole("Mod", plain);
    expectWhole("", plain);
    expectRefused("Mod4294967296", plain);
}

TEST(ParsePlainName, RangeMayBeAllDigits) {
    expectNumbered("Mod1:4", plain, "Mod", 1, 4);
    expectNumbered("12:14", plain, "", 12, 14);
    for (const char* name : {":", ":4", "Mod:4", "12:", "Mod4:1", "Mod1:2:3", "Mod1:1025"}) {
        expectRefused(name, plain);
    }
}

TEST(ParsePlainName, RefusesSlashes) {
    for (const char* name : {"Mod/ch0", "/", "Mod1/ch0:2"}) {
        expectRefused(name, plain);
    }
}

TEST(ParseName, ReportsTheNameEscaped) {
    shared_test::expectRefused("a\\\"\\n\xc3\xa9/1:", [] { parseName("a\"\n\xc3\xa9/1:", path); });
}

TEST(ParseName, InvalidUtf8IsReportedBeforeAMalformedName) {
    try {
        parseName("Mod\xff/ch4:1", path);
        ADD_FAILURE() << "not refused";
    } catch (const BasicError& error) {
        EXPECT_EQ(error.status()->code, -250832);
        EXPECT_EQ(std::string(error.what()).find("translator"), std::string::npos);
    }
}

TEST(ParseName, ValidRangeIsNotCheckedForUtf8) {
    expectNumbered("\xff/ch1", path, "\xff/ch", 1, 1);
}
