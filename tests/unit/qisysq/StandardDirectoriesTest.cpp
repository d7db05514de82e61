#include "qisysq/StandardDirectories.h"

#include <dlfcn.h>
#include <gtest/gtest.h>

#include <map>
#include <string>

#include "qisysq/installRoot.h"
#include "qisysq/stdpath.h"
#include "support/FaultyAllocator.h"
#include "support/TestPaths.h"

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
        EXPECT_EQ(lookUp(table, key.c_str()), qisysq_installRoot() + directory) << key;
    }
}

TEST(StandardDirectoriesTest, ALibraryWithoutTheFunctionRelocatesNothing) {
    const qisysq::StandardDirectories table(lackingRelocations);
    EXPECT_EQ(lookUp(table, "bindir"), std::string(qisysq_installRoot()) + "/usr/bin");
}

TEST(StandardDirectoriesTest, ARelocatedDirectoryIsUsedUnchanged) {
    const qisysq::StandardDirectories table(completeRelocations);
    EXPECT_EQ(lookUp(table, "bindir"), "/moved/bin");
    EXPECT_EQ(lookUp(table, "docdir"), std::string(255, 'd'));
    EXPECT_EQ(lookUp(table, "sbindir"), std::string(qisysq_installRoot()) + "/usr/sbin");
}

TEST(StandardDirectoriesTest, AFailedRelocationIsReportedForItsKeyOnly) {
    const qisysq::StandardDirectories table(completeRelocations);
    EXPECT_EQ(lookUp(table, "libdir"), "failed with -52006");
    EXPECT_EQ(lookUp(table, "libdir"), "failed with -52006");
    EXPECT_EQ(lookUp(table, "bindir"), "/moved/bin");
}

TEST(StandardDirectoriesTest, TheLibraryIsUnloadedAgain) {
    const qisysq::StandardDirectories table(completeRelocations);
    EXPECT_EQ(dlopen(completeRelocations, RTLD_NOW | RTLD_NOLOAD), nullptr);
}

TEST(StandardDirectoriesTest, AnUnknownKeyIsAnErrorWithoutDetails) {
    qierr::Status status;
    qihtl::String directory;
    qisysq::getStandardDir("nosuchdir", &directory, &status);
    EXPECT_EQ(status.code, -52008);
    EXPECT_EQ(status.json, nullptr);
}

TEST(StandardDirectoriesTest, TheProcessWideTableFindsTheLibraryByItsName) {
    // A loaded library is found by its name wherever it was loaded from.
    void* library = dlopen(completeRelocations, RTLD_NOW);
    ASSERT_NE(library, nullptr) << dlerror();
    const qisysq::StandardDirectories table("libqirelocations.so.0");
    EXPECT_EQ(lookUp(table, "bindir"), "/moved/bin");
    dlclose(library);
}

TEST(StandardDirectoriesTest, AFailureToBuildTheTableIsReportedOnEachLookup) {
    FaultyAllocator::failAt(3);
    const qisysq::StandardDirectories table(absent);
    FaultyAllocator::succeed();
    EXPECT_EQ(lookUp(table, "bindir"), "failed with -52000");
    EXPECT_EQ(lookUp(table, "prefixdir"), "failed with -52000");
    EXPECT_EQ(lookUp(table, "nosuchdir"), "failed with -52000");
}

TEST(StandardDirectoriesTest, ALookupDoesNothingWhenTheStatusIsNegative) {
    qierr::Status status;
    status.code = -1;
    qihtl::String directory;
    qisysq::getStandardDir("bindir", &directory, &status);
    EXPECT_EQ(status.code, -1);
    EXPECT_TRUE(directory.empty());
}

}  // namespace
