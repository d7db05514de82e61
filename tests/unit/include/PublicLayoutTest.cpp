// The structures that cross the borders between separately built programs. Their layouts depend on
// the size of a pointer alone, not on how the build counts files and times.

#include <gtest/gtest.h>
#include <qierr_status.h>
#include <qirelocations.h>
#include <qitrmcapi.h>
#include <qitrmcsim.h>
#include <qixlatormgr.h>
#include <sys/types.h>
#include <ws_runtime.h>

#include <cstddef>
#include <ctime>

namespace {

constexpr std::size_t pointer = sizeof(void*);

TEST(PublicLayout, FilesAndTimesAreCountedIn64Bits) {
    EXPECT_EQ(_FILE_OFFSET_BITS, 64);
    EXPECT_EQ(_TIME_BITS, 64);
    EXPECT_EQ(sizeof(off_t), 8u);
    EXPECT_EQ(sizeof(ino_t), 8u);
    EXPECT_EQ(sizeof(std::time_t), 8u);
}

TEST(PublicLayout, AStatusIsTwoNumbersAndTwoPointers) {
    EXPECT_EQ(offsetof(qierr_Status, code), 0u);
    EXPECT_EQ(offsetof(qierr_Status, capacity), 4u);
    EXPECT_EQ(offsetof(qierr_Status, reallocJson), 8u);
    EXPECT_EQ(offsetof(qierr_Status, json), 8 + pointer);
    EXPECT_EQ(sizeof(qierr_Status), 8 + 2 * pointer);
}

TEST(PublicLayout, ATranslatorIsItsSizeAndThreeFunctions) {
    EXPECT_EQ(offsetof(XlatorInterface, structSize), 0u);
    EXPECT_EQ(offsetof(XlatorInterface, destroy), pointer);
    EXPECT_EQ(offsetof(XlatorInterface, getStaticDesc), 2 * pointer);
    EXPECT_EQ(offsetof(XlatorInterface, getDynamicDesc), 3 * pointer);
    EXPECT_EQ(sizeof(XlatorInterface), 4 * pointer);
}

TEST(PublicLayout, WhatTheWebServerHandsOverIsPointersAlone) {
    EXPECT_EQ(offsetof(ws_WideString, end), pointer);
    EXPECT_EQ(sizeof(ws_WideString), 2 * pointer);
    EXPECT_EQ(offsetof(ws_EntryOperations, entryName), 3 * pointer);
    EXPECT_EQ(sizeof(ws_EntryOperations), 4 * pointer);
    EXPECT_EQ(sizeof(ws_Entry), pointer);
}

TEST(PublicLayout, HandlesAndCountsHave32Bits) {
    EXPECT_EQ(sizeof(nQITRMCAPI100_Session), 4u);
    EXPECT_EQ(sizeof(nQITRMCAPI100_Property), 4u);
    EXPECT_EQ(sizeof(nQITRMCAPI100_Command), 4u);
    EXPECT_EQ(sizeof(qitrmcsim_Outstanding), 24u);
}

}  // namespace
