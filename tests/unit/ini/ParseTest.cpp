#include "TemporaryIni.h"

using namespace ini_test;

TEST(IniLines, EndAtReturnNewlineOrNul) {
    const Texts expected{"[a]", "b=1", "c=2"};
    EXPECT_EQ(contents(*loaded("[a]\nb=1\nc=2")), expected);
    EXPECT_EQ(contents(*loaded("[a]\rb=1\rc=2\r")), expected);
    EXPECT_EQ(contents(*loaded("[a]\r\nb=1\r\nc=2\r\n")), expected);
    EXPECT_EQ(contents(*loaded(std::string("[a]\0b=1\0c=2\0", 12))), expected);
}

TEST(IniLines, TwoDifferentEndsCountAsOne) {
    const auto lineOfKey = [](const std::string& ends) {
        return loaded("[a]" + ends + "b=1")->sections[0].entries[0].line;
    };
    EXPECT_EQ(lineOfKey("\n"), 2);
    EXPECT_EQ(lineOfKey("\r\n"), 2);
    EXPECT_EQ(lineOfKey("\n\r"), 2);
    EXPECT_EQ(lineOfKey(std::string("\0\n", 2)), 2);
    EXPECT_EQ(lineOfKey("\n\n"), 3);
    EXPECT_EQ(lineOfKey("\r\r\n"), 3);
    EXPECT_EQ(lineOfKey("\r\n\r\n"), 3);
    EXPECT_EQ(lineOfKey(std::string("\0\0", 2)), 3);
}

TEST(IniLines, EndMayBeSplitByTheReadBuffer) {
    for (std::size_t length : {2082u, 2083u, 2084u, 2085u, 4167u, 4168u}) {
        SCOPED_TRACE(length);
        const File file = loaded(";" + std::string(length - 1, 'x') + "\r\n[a]\r\nb=1\r\n");
        EXPECT_EQ(contents(*file), (Texts{"[a]", "b=1"}));
        EXPECT_EQ(file->sections[0].line, 2);
    }
}

TEST(IniLines, MayBeLong) {
    const std::string value(100000, 'v');
    EXPECT_EQ(contents(*loaded("[a]\nb=" + value + "\nc=1")), (Texts{"[a]", "b=" + value, "c=1"}));
}

TEST(IniParse, ReadsSectionsAndKeysInOrder) {
    const File file = loaded(
        "; comment\n\n"
        "  [WebService]  rest\n"
        "\tEnable = 1\n"
        " ;x=1\n"
        "two words\t=  a value \t\n"
        "[Other ]\n"
        "k=a=b\n");
    EXPECT_EQ(contents(*file),
              (Texts{"[WebService]", "Enable=1", "two words=a value", "[Other]", "k=a=b"}));
    EXPECT_EQ(file->firstBadLine, -1);
    EXPECT_EQ(file->sections[0].line, 3);
    EXPECT_EQ(file->sections[0].entries[1].line, 6);
}

TEST(IniParse, KeepsTheFirstBadLineOnly) {
    for (const char* bad : {"no separator", "= no key", "[open", "[]", "[ \t]", "empty =", "= "}) {
        SCOPED_TRACE(bad);
        const File file = loaded("[a]\nb=1\n" + std::string(bad) + "\nc=2\nalso bad\n");
        EXPECT_EQ(file->firstBadLine, 3);
        EXPECT_EQ(contents(*file), (Texts{"[a]", "b=1", "c=2"}));
    }
}

TEST(IniParse, DropsKeysBeforeTheFirstSection) {
    const File file = loaded("k=1\n[a]\nb=1\n");
    EXPECT_EQ(contents(*file), (Texts{"[a]", "b=1"}));
    EXPECT_EQ(file->firstBadLine, -1);
}

TEST(IniParse, MergesRepeatedNames) {
    EXPECT_EQ(contents(*loaded("[a]\nk=1\nl=2\n[b]\nk=3\n[A]\nK=4\nm=5\n")),
              (Texts{"[a]", "k=4", "l=2", "m=5", "[b]", "k=3"}));
}

TEST(IniParse, AppendsRepeatedNamesWithoutMerging) {
    const TemporaryFile source("[a]\nk=1\nk=2\n[a]\nk=3\n");
    const File file = created();
    file->mergeRepeated = false;
    ASSERT_EQ(IniFile_load(file.get(), source.name()), 0);
    EXPECT_EQ(contents(*file), (Texts{"[a]", "k=1", "k=2", "[a]", "k=3"}));
}

TEST(IniParse, DistinguishesCaseOnRequest) {
    const TemporaryFile source("[a]\nk=1\nK=2\n[A]\nk=3\n");
    const File file = created();
    file->ignoreCase = false;
    ASSERT_EQ(IniFile_load(file.get(), source.name()), 0);
    EXPECT_EQ(contents(*file), (Texts{"[a]", "k=1", "K=2", "[A]", "k=3"}));
}

TEST(IniParse, StripsDoubleQuotes) {
    const File file = loaded("[a]\nb=\" x \"\nc='y'\nd=\"\ne=\"z'\nf=\"\"\n");
    EXPECT_EQ(contents(*file), (Texts{"[a]", "b= x ", "c='y'", "d=\"", "e=\"z'", "f="}));
    EXPECT_EQ(file->sections[0].entries[0].quote, '"');
    EXPECT_EQ(file->sections[0].entries[1].quote, 0);
}

TEST(IniParse, StripsSingleQuotesOnRequest) {
    const File file = loaded("[a]\nb='x'\nc=\"y\"\n", ini_stripSingleQuotes);
    EXPECT_EQ(contents(*file), (Texts{"[a]", "b=x", "c=\"y\""}));
    EXPECT_EQ(file->sections[0].entries[0].quote, '\'');
}

TEST(IniParse, AcceptsEmptyValuesOnRequest) {
    const File file = loaded("[a]\nb=\nc= \n", ini_acceptEmptyValues);
    EXPECT_EQ(contents(*file), (Texts{"[a]", "b=", "c="}));
    EXPECT_EQ(file->firstBadLine, -1);
}

TEST(IniParse, AcceptsColonsOnRequest) {
    const File file = loaded("k:0\n[a]\nb:1\nc := 2\nd=3:4\ne : = 5\n", ini_acceptColons);
    EXPECT_EQ(contents(*file), (Texts{"[(null)]", "k=0", "[a]", "b=1", "c=2", "d=3:4", "e== 5"}));
    EXPECT_EQ(contents(*loaded("[a]\nb:c=1\n")), (Texts{"[a]", "b:c=1"}));
    EXPECT_EQ(loaded("[a]\nb:1\n")->firstBadLine, 2);
}

TEST(IniParse, ReadsManyNamesInLinearTime) {
    std::string content = "[keys]\n";
    for (int i = 0; i < 300000; ++i) {
        content += "key" + std::to_string(i) + "=1\n";
    }
    for (int i = 0; i < 300000; ++i) {
        content += "[section" + std::to_string(i) + "]\n";
    }
    const File file = loaded(content);
    EXPECT_EQ(file->sections.size(), 300001u);
    EXPECT_EQ(file->sections[0].entries.size(), 300000u);
}
