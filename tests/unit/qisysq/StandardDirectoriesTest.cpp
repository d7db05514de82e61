#include "qisysq/StandardDirectories.h"

#include <dlfcn.h>
#include <gtest/gtest.h>

#include <map>
#include <string>

#include "qisysq/installRoot.h"
#include "qisysq/stdpath.h"
#include "support/FaultyAllocator.h"

namespace {

constexpr const char* absent = "libabsent-from-every-system.so.0";

std::string lookUp(const qisysq::StandardDirectories& table, const char* key) {
    qierr::Status status;
    qihtl::String directory;
    table.get(key, &directory, &status);
    return status.code < 0 ? "failed with " + std::to_string(status.code) : directory.c_str();
}

const std::map<std::string, std::string> defaults = {
    {"prefixdir", "/usr"},
    {"execprefixdir", "/usr"},
    {"bindir", "/usr/bin"},
    {"sbindir", "/usr/sbin"},
    {"libdir", "/usr/lib"},
    {"lib32dir", "/usr/lib"},
    {"lib64dir", "/usr/lib64"},
    {"nativelibdir", "/usr/lib"},
    {"multiarchlibdir", "/usr/lib/" MULTIARCH},
    {"libexecdir", "/usr/libexec"},
    {"sharedstatedir", "/var/lib"},
    {"datarootdir", "/usr/share"},
    {"datadir", "/usr/share"},
    {"sysconfdir", "/etc"},
    {"localstatedir", "/var"},
    {"runstatedir", "/var/run"},
    {"includedir", "/usr/include"},
    {"docdir", "/usr/share/doc"},
    {"initddir", "/etc/init.d"},
};

TEST(StandardDirectoriesTest, WithoutTheLibraryEveryKeyHasItsDefaultBelowTheRoot) {
    const qisysq::StandardDirectories table(absent);
    for (const auto& [key, directory] : defaults) {
        EXPECT_EQ(qisysq_installRoot() + directory, lookUp(table, key.c_str())) << key;
    }
}

TEST(StandardDirectoriesTest, ALibraryWithoutTheFunctionRelocatesNothing) {
    const qisysq::StandardDirectories table(RELOCATIONS_LACKING);
    EXPECT_EQ(std::string(qisysq_installRoot()) + "/usr/bin", lookUp(table, "bindir"));
}

TEST(StandardDirectoriesTest, ARelocatedDirectoryIsUsedAsItStands) {
    const qisysq::StandardDirectories table(RELOCATIONS_COMPLETE);
    EXPECT_EQ("/moved/bin", lookUp(table, "bindir"));
    EXPECT_EQ(std::string(255, 'd'), lookUp(table, "docdir"));
    EXPECT_EQ(std::string(qisysq_installRoot()) + "/usr/sbin", lookUp(table, "sbindir"));
}

TEST(StandardDirectoriesTest, AFailedRelocationIsReportedForItsKeyOnly) {
    const qisysq::StandardDirectories table(RELOCATIONS_COMPLETE);
    EXPECT_EQ("failed with -52006", lookUp(table, "libdir"));
    EXPECT_EQ("failed with -52006", lookUp(table, "libdir"));
    EXPECT_EQ("/moved/bin", lookUp(table, "bindir"));
}

TEST(StandardDirectoriesTest, TheLibraryIsUnloadedAgain) {
    const qisysq::StandardDirectories table(RELOCATIONS_COMPLETE);
    EXPECT_EQ(nullptr, dlopen(RELOCATIONS_COMPLETE, RTLD_NOW | RTLD_NOLOAD));
}

TEST(StandardDirectoriesTest, AnUnknownKeyIsAnErrorWithoutDetails) {
    qierr::Status status;
    qihtl::String directory;
    qisysq::getStandardDir("nosuchdir", &directory, &status);
    EXPECT_EQ(-52008, status.code);
    EXPECT_EQ(nullptr, status.json);
}

TEST(StandardDirectoriesTest, TheProcessWideTableFindsTheLibraryByItsName) {
    // A loaded library is found by its name wherever it was loaded from.
    void* library = dlopen(RELOCATIONS_COMPLETE, RTLD_NOW);
    ASSERT_NE(nullptr, library) << dlerror();
    const qisysq::StandardDirectories table("libqirelocations.so.0");
    EXPECT_EQ("/moved/bin", lookUp(table, "bindir"));
    dlclose(library);
}

TEST(StandardDirectoriesTest, AFailureOfBuildingIsReportedOnEachLookup) {
    FaultyAllocator::failAt(3);
    const qisysq::StandardDirectories table(absent);
    FaultyAllocator::succeed();
    EXPECT_EQ("failed with -52000", lookUp(table, "bindir"));
    EXPECT_EQ("failed with -52000", lookUp(table, "prefixdir"));
    EXPECT_EQ("failed with -52000", lookUp(table, "nosuchdir"));
}

TEST(StandardDirectoriesTest, ALookupDoesNothingWhenTheStatusIsNegative) {
    qierr::Status status;
    status.code = -1;
    qihtl::String directory;
    qisysq::getStandardDir("bindir", &directory, &status);
    EXPECT_EQ(-1, status.code);
    EXPECT_TRUE(directory.empty());
}

}  // namespace
