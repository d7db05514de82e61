#include "qisysq/qidynlib.h"

#include <dlfcn.h>
#include <gtest/gtest.h>

#include <string>

#include "contains.h"
#include "support/TestPaths.h"

namespace {

TEST(QidynlibTest, LoadsALibraryAndFindsASymbol) {
    qierr::Status status;
    void* handle = qidynlib_load(completeRelocations, &status);
    EXPECT_NE(qidynlib_symbol(handle, "get_relocated_dir", &status), nullptr);
    EXPECT_EQ(status.code, 0);
    dlclose(handle);
}

TEST(QidynlibTest, AMissingLibraryIsReportedWithTheLoadersText) {
    qierr::Status status;
    EXPECT_EQ(qidynlib_load("libabsent-from-every-system.so.0", &status), nullptr);
    EXPECT_EQ(status.code, -52005);
    EXPECT_TRUE(contains(status, "\"error_constant\":\"qiapalerr_invalidParameter\""));
    EXPECT_TRUE(contains(status,
                         "\"qidynlib_debug\":{\"debug\":\"failed to qidynlib_load library\","
                         "\"path\":\"libabsent-from-every-system.so.0\"},"
                         "\"internal_error\":{\"api\":\"dlerror\",\"string\":\"libabsent"))
        << status.json;
    EXPECT_EQ(dlerror(), nullptr) << "the pending text was not cleared";
}

TEST(QidynlibTest, AMissingSymbolIsReportedWithTheLoadersText) {
    qierr::Status status;
    void* handle = qidynlib_load(lackingRelocations, &status);
    EXPECT_EQ(qidynlib_symbol(handle, "get_relocated_dir", &status), nullptr);
    EXPECT_EQ(status.code, -52005);
    EXPECT_TRUE(contains(status,
                         "\"qidynlib_debug\":{\"debug\":\"failed to get symbol\","
                         "\"qidynlib_symbol\":\"get_relocated_dir\"},"
                         "\"internal_error\":{\"api\":\"dlerror\",\"string\":\""))
        << status.json;
    EXPECT_EQ(dlerror(), nullptr);
    dlclose(handle);
}

TEST(QidynlibTest, TheSymbolsOfALibraryAreVisibleToTheWholeProcess) {
    ASSERT_EQ(dlsym(RTLD_DEFAULT, "another_function"), nullptr);
    qierr::Status status;
    // A library of its own, since finding the symbol keeps it loaded.
    void* handle = qidynlib_load(sharedSymbols, &status);
    ASSERT_NE(handle, nullptr);
    EXPECT_NE(dlsym(RTLD_DEFAULT, "another_function"), nullptr);
    dlclose(handle);
}

TEST(QidynlibTest, AnUnresolvedFunctionFailsTheLoadAtOnce) {
    qierr::Status status;
    EXPECT_EQ(qidynlib_load(unresolvedRelocations, &status), nullptr);
    EXPECT_EQ(status.code, -52005);
    EXPECT_TRUE(contains(status, "function_of_no_library")) << status.json;
}

TEST(QidynlibTest, NothingIsDoneWhenTheStatusIsNegative) {
    qierr::Status status;
    status.code = -1;
    EXPECT_EQ(qidynlib_load(completeRelocations, &status), nullptr);
    EXPECT_EQ(qidynlib_symbol(nullptr, "get_relocated_dir", &status), nullptr);
    EXPECT_EQ(status.code, -1);
    EXPECT_EQ(status.json, nullptr);
}

}  // namespace
