#include "qitrmcwebsvc/KnownNames.h"

#include <string>
#include <vector>

#include "support/DriverTest.h"

using namespace nQITRMCWEBSVC100;

namespace {

class KnownNamesTest : public DriverTest {
  protected:
    // So many names are found in other ways than a few.
    static constexpr int many = 200;

    static Calls namesFrom(const std::string& prefix, int first, int count) {
        Calls names;
        for (int i = 0; i < count; ++i) {
            names.push_back(prefix + std::to_string(first + i));
        }
        return names;
    }

    void listDevices(const Calls& names) {
        driver.give("getSystemPropertyStringArray(7, \"Sys.Devices\")", names);
    }

    // In a list that is read for this name alone.
    static bool isListed(const std::string& name) { return KnownNames(7).contains(name); }
};

TEST_F(KnownNamesTest, FindsNamesInOneListInAnySpelling) {
    listDevices(namesFrom("Mod", 1, many));
    KnownNames known(7);
    for (const char* prefix : {"Mod", "mOD", "MOD"}) {
        for (const std::string& name : namesFrom(prefix, 1, many)) {
            EXPECT_TRUE(known.contains(name)) << name;
        }
        EXPECT_FALSE(known.contains(prefix + std::to_string(many + 1)));
        EXPECT_FALSE(known.contains(prefix));
    }
    EXPECT_FALSE(known.contains(""));
}

TEST_F(KnownNamesTest, FindsEachNameInAListOfItsOwnInAnySpelling) {
    listDevices(namesFrom("Mod", 1, many));
    for (const char* prefix : {"Mod", "mOD", "Mod"}) {
        for (const std::string& name : namesFrom(prefix, 1, many)) {
            EXPECT_TRUE(isListed(name)) << name;
        }
        EXPECT_FALSE(isListed(prefix + std::to_string(many + 1)));
    }
}

TEST_F(KnownNamesTest, FindsANameThatHasMoved) {
    Calls names = namesFrom("Mod", 1, many);
    names.push_back("moving");
    listDevices(names);
    EXPECT_TRUE(isListed("moving"));
    names.insert(names.begin(), "moving");
    names.pop_back();
    listDevices(names);
    EXPECT_TRUE(isListed("moving"));
}

TEST_F(KnownNamesTest, DoesNotFindANameThatIsNoLongerListed) {
    Calls names = namesFrom("Mod", 1, many);
    names.back() = "leaving";
    listDevices(names);
    EXPECT_TRUE(isListed("leaving"));
    names.back() = "another";
    listDevices(names);
    EXPECT_FALSE(isListed("leaving"));
    names.back() = "leaving";
    listDevices(names);
    EXPECT_TRUE(isListed("leaving"));
    names.pop_back();
    listDevices(names);
    EXPECT_FALSE(isListed("leaving"));
}

TEST_F(KnownNamesTest, DoesNotFindAnEarlierNameInAListThatCannotBeRead) {
    listDevices(namesFrom("Mod", 1, many));
    EXPECT_TRUE(isListed("Mod1"));
    driver.reply("getSystemPropertyStringArray(7, \"Sys.Devices\")",
                 {namesFrom("Mod", 1, many), -12});
    EXPECT_FALSE(isListed("Mod1"));
}

TEST_F(KnownNamesTest, FoldsLettersInALongList) {
    Calls names = namesFrom("Mod", 1, many);
    names.insert(names.end(), {"Stra\u00dfe", "10 \u212a"});
    listDevices(names);
    KnownNames known(7);
    for (const char* name : {"STRASSE", "strasse", "10 k", "stra\u00dfe"}) {
        EXPECT_TRUE(isListed(name)) << name;
        EXPECT_TRUE(known.contains(name)) << name;
    }
    EXPECT_FALSE(isListed("strase"));
    EXPECT_FALSE(known.contains("strase"));
}

TEST_F(KnownNamesTest, FindsARepeatedNameInALongList) {
    Calls names(many, "same");
    names.push_back("last");
    listDevices(names);
    KnownNames known(7);
    for (const char* name : {"SAME", "same", "LAST", "last"}) {
        EXPECT_TRUE(known.contains(name)) << name;
    }
    EXPECT_FALSE(known.contains("other"));
}

TEST_F(KnownNamesTest, SearchesAListOfADevice) {
    driver.give("getGenericPropertyStringArray(7, \"Mod1\", \"Dev.PhysChans\")",
                namesFrom("Mod1/ch", 0, many));
    KnownNames known(7, "Mod1", "Dev.PhysChans");
    EXPECT_TRUE(known.contains("mod1/CH7"));
    EXPECT_FALSE(known.contains("Mod1/ch" + std::to_string(many)));
}

}  // namespace
