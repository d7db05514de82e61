#include <sys/stat.h>

#include "TemporaryIni.h"

using namespace ini_test;

TEST(IniCreate, StartsEmptyWithTheDefaults) {
    const File file(IniFile_create());
    ASSERT_NE(file, nullptr);
    EXPECT_TRUE(file->sections.empty());
    EXPECT_EQ(file->firstBadLine, -1);
    EXPECT_TRUE(file->mergeRepeated);
    EXPECT_TRUE(file->ignoreCase);
    EXPECT_EQ(file->flags, 2u);
    EXPECT_EQ(file->path, "");
}

TEST(IniLoad, MissingFileIsMinus22) {
    const File file = created();
    EXPECT_EQ(IniFile_load(file.get(), "/nonexistent/qitrmc.ini"), -22);
    EXPECT_EQ(IniFile_load(file.get(), nullptr), -22);
    EXPECT_EQ(IniFile_load(file.get(), ""), -22);
    EXPECT_EQ(file->path, "");
}

TEST(IniLoad, UnreadableFileIsMinus5001) {
    const File file = created();
    EXPECT_EQ(IniFile_load(file.get(), testing::TempDir().c_str()), -5001);
}

TEST(IniLoad, FileThatDoesNotOpenIsMinus5001EvenForRoot) {
    const TemporaryFile place("");
    ASSERT_EQ(unlink(place.name()), 0);
    // A socket cannot be opened as a file, not even by root.
    ASSERT_EQ(mknod(place.name(), S_IFSOCK | 0600, 0), 0);
    EXPECT_EQ(IniFile_load(created().get(), place.name()), -5001);
}

TEST(IniLoad, KeepsPathAndModificationTime) {
    const TemporaryFile source("[a]\nb=1\n");
    struct stat properties;
    ASSERT_EQ(stat(source.name(), &properties), 0);
    const File file = created();
    EXPECT_EQ(IniFile_load(file.get(), source.name()), 0);
    EXPECT_EQ(file->path, source.name());
    EXPECT_EQ(file->modified, properties.st_mtime);
}

TEST(IniLoad, SkipsTheByteOrderMarkOfUtf8) {
    EXPECT_EQ(contents(*loaded("\xEF\xBB\xBF[a]\nb=1\n")), (Texts{"[a]", "b=1"}));
}

TEST(IniLoad, RefusesTheByteOrderMarksOfOtherEncodings) {
    const std::string marks[] = {"\xFF\xFE", "\xFE\xFF", std::string("\xFF\xFE\0\0", 4),
                                 std::string("\0\0\xFE\xFF", 4)};
    for (const std::string& mark : marks) {
        for (const std::string& rest : {std::string(), std::string("[a]\nb=1\n")}) {
            const TemporaryFile source(mark + rest);
            const File file = created();
            EXPECT_EQ(IniFile_load(file.get(), source.name()), -3);
            EXPECT_TRUE(file->sections.empty());
        }
    }
}

TEST(IniLoad, ReadsShortFiles) {
    EXPECT_TRUE(loaded("")->sections.empty());
    EXPECT_TRUE(loaded("\xEF\xBB\xBF")->sections.empty());
    EXPECT_EQ(loaded("a")->firstBadLine, 1);
    EXPECT_EQ(contents(*loaded("[a]")), (Texts{"[a]"}));
    EXPECT_EQ(loaded("\xEF\xBB")->firstBadLine, 1);
}

TEST(IniLoad, ReplacesWhatWasLoadedBefore) {
    const File file = loaded("[a]\nb=1\n");
    const TemporaryFile source("[c]\nd=2\n");
    EXPECT_EQ(IniFile_load(file.get(), source.name()), 0);
    EXPECT_EQ(contents(*file), (Texts{"[c]", "d=2"}));
}

TEST(IniLoad, FailureKeepsWhatWasLoadedBefore) {
    const File file = loaded("[a]\nb=1\n");
    EXPECT_EQ(IniFile_load(file.get(), "/nonexistent/qitrmc.ini"), -22);
    EXPECT_EQ(contents(*file), (Texts{"[a]", "b=1"}));
}

TEST(IniLoad, AbsentFileObjectIsHarmless) {
    std::uint32_t value = 7;
    EXPECT_EQ(IniFile_load(nullptr, "/nonexistent/qitrmc.ini"), -12);
    EXPECT_EQ(IniFile_getInt(nullptr, "a", "b", &value), 0);
    EXPECT_EQ(value, 7u);
    IniFile_destroy(nullptr);
}
