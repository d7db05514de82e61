#include "TemporaryIni.h"

using namespace ini_test;

namespace {

Texts joined(const std::string& keys) {
    return contents(*loaded("[s]\n" + keys));
}

}  // namespace

TEST(IniSplitValues, AreJoinedIntoTheFirstEntry) {
    EXPECT_EQ(joined("Text Line1=ab\nText Line2=\" cd \"\nText Line3=ef\n"),
              (Texts{"[s]", "Text=ab cd ef"}));
}

TEST(IniSplitValues, RunEndsBeforeAKeyWithoutTheEnding) {
    EXPECT_EQ(joined("a=1\nT Line1=x\nT Line2=y\nb=2\nT Line3=z\n"),
              (Texts{"[s]", "a=1", "T=xy", "b=2", "T Line3=z"}));
}

TEST(IniSplitValues, RunEndsBeforeTheNextNumberOne) {
    EXPECT_EQ(joined("T Line1=x\nT Line2=y\nU Line1=z\n"), (Texts{"[s]", "T=xy", "U=z"}));
}

TEST(IniSplitValues, NumbersInBetweenAreNotChecked) {
    EXPECT_EQ(joined("T Line1=x\nT Line7=y\nU Line0=z\n"), (Texts{"[s]", "T=xyz"}));
}

TEST(IniSplitValues, RunNeedsANumberOneToBegin) {
    EXPECT_EQ(joined("T Line2=x\nT Line3=y\n"), (Texts{"[s]", "T Line2=x", "T Line3=y"}));
}

TEST(IniSplitValues, EndingMustMatchExactly) {
    EXPECT_EQ(joined("TLine1=x\nT Line=y\nT Line1x=z\nT Line 1=u\nLine1=v\n"),
              (Texts{"[s]", "TLine1=x", "T Line=y", "T Line1x=z", "T Line 1=u", "Line1=v"}));
}

TEST(IniSplitValues, EachSectionIsJoinedSeparately) {
    EXPECT_EQ(contents(*loaded("[a]\nT Line1=x\n[b]\nT Line2=y\n")),
              (Texts{"[a]", "T=x", "[b]", "T Line2=y"}));
}
