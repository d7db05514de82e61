#include <fcntl.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <string>

#include "StatusTexts.h"
#include "qierr/Writer.h"
#include "qixlator/KeptSearches.h"
#include "qixlator/Registration.h"
#include "qixlator/json1.h"
#include "qixlator/qixlator.h"
#include "qixlatorlua/BytecodeCache.h"
#include "qixlatorlua/LuaXlator.h"
#include "qixlatorlua/PreparedStates.h"
#include "support/FaultyAllocator.h"
#include "support/TestRoot.h"
#include "support/cjsonLeak.h"
#include "support/series.h"

namespace {

using qixlatorlua::LuaRuntime;

// Makes each single allocation of a translation fail in turn, and each one together with all that
// follow it. The process must go on, nothing may leak, and there must be a failure or a text.
class MemoryFaultTest : public testing::Test {
  protected:
    MemoryFaultTest() {
        root.write("/etc/qinstal/share/share.dir", root.locate("/shared"));
        root.write("/shared/mierrors/qitrmc/English/a.txt",
                   "<?xml version=\"1.0\"?>\n<qidocument>\n<qierror code=\"-1\">\nText.\n"
                   "</qierror>\n</qidocument>\n");
        qierr_Status_setCode(&source, -1);
        const std::string entry =
            statusTexts::usage("kUsageTypeReservedBySessions", "[\"a\",\"b\"]", "\"string\"");
        const std::string outer = statusTexts::withEntries(entry);
        const std::string json = outer.substr(0, outer.size() - 1) +
                                 ",\"nested_error\":[{\"code\":-1,\"translator\":"
                                 "\"mxlator_qitrmc\"}]}";
        qierr_Status_setJson(&source, json.c_str());
        translateWholly();  // what is made once in the process is made now
    }
    ~MemoryFaultTest() override { FaultyAllocator::succeed(); }

    // The translation as the service does it: a session, the raw text, the end of the session.
    void translateWholly() {
        failureCode = 0;
        text.clear();
        qierr::Status failure;
        qixlator::Session* session = qixlator_createSession(&failure);
        if (session != nullptr) {
            qihtl::String raw;
            qixlator::json1::translateErrStatusToRawText(session, &source, 0x200, 15, &raw,
                                                         &failure);
            text.assign(raw.c_str(), raw.length());
        }
        qixlator_destroySession(session);
        failureCode = failure.code;
    }

    // A translator of its own, from which both descriptions are requested.
    void askTranslator(LuaRuntime runtime) {
        text.clear();
        qierr::Status failure;
        XlatorInterface* xlator = qixlatorlua::createLuaXlator(
            "mxlator_qitrmc", qixlator::localRegistrations().next->registrationInfo, runtime,
            &failure);
        if (xlator != nullptr) {
            take(xlator->getStaticDesc(xlator, -1, 0x200, qixlator_realloc, nullptr, &failure));
            take(xlator->getDynamicDesc(xlator, source.json, 0x200, "json1", qixlator_realloc,
                                        nullptr, &failure));
            xlator->destroy(xlator);
        }
        failureCode = failure.code;
    }

    void take(char* description) {
        text += description == nullptr ? "" : description;
        qixlator_realloc(description, 0, nullptr, nullptr);
    }

    // The interpreter's handles for these files must never close them.
    static bool standardFilesAreOpen() {
        return fcntl(STDIN_FILENO, F_GETFD) >= 0 && fcntl(STDOUT_FILENO, F_GETFD) >= 0 &&
               fcntl(STDERR_FILENO, F_GETFD) >= 0;
    }

    // Runs `action` with `count` requests failing from request `first` on, then from `step` later,
    // and so on. Returns the first number beyond its requests.
    template <typename Action>
    std::uint64_t failEach(Action action, std::uint64_t count, std::uint64_t first = 0,
                           std::uint64_t step = failureStep) {
        for (std::uint64_t number = first;; number += step) {
            qixlator::KeptSearches::ofProcess().clear();
            const std::int64_t blocks = FaultyAllocator::liveBlocks();
            FaultyAllocator::failAt(number, count);
            action();
            // A search is kept as soon as its files are old enough, which must not be counted.
            qixlator::KeptSearches::ofProcess().clear();
            const bool failed = FaultyAllocator::hasFailed();
            FaultyAllocator::succeed();
            EXPECT_EQ(FaultyAllocator::liveBlocks(), blocks) << "request " << number;
            EXPECT_TRUE(standardFilesAreOpen()) << "request " << number;
            EXPECT_TRUE(failureCode < 0 || !text.empty()) << "request " << number;
            if (!failed || HasFailure()) {
                EXPECT_EQ(failureCode, 0);
                return number;
            }
        }
    }

    TestRoot root;
    qierr::Status source;
    std::int32_t failureCode = 0;
    std::string text;
};

TEST_F(MemoryFaultTest, ATranslationSurvivesEachSingleFailure) {
    EXPECT_LT(20u, failEach([this] { translateWholly(); }, 1));
    EXPECT_EQ(text.find("Text.\n\nReserved by Sessions: a, b\n"), 0u) << text;
}

TEST_F(MemoryFaultTest, ATranslationSurvivesTheEndOfAllMemoryAtEachPoint) {
    EXPECT_LT(20u, failEach([this] { translateWholly(); }, FaultyAllocator::never));
}

TEST_F(MemoryFaultTest, ATranslationNeedsLittleMemoryBeyondWhatIsKept) {
    FaultyAllocator::succeed();
    const std::int64_t before = FaultyAllocator::liveBytes();
    translateWholly();
    EXPECT_LT(FaultyAllocator::peakBytes() - before, 300 * 1024);
}

// With two translations at the same time, the states of both are kept.
TEST_F(MemoryFaultTest, WhatIsKeptBetweenFailuresIsAtMostOneMebibyte) {
    qixlatorlua::PreparedStates& states = qixlatorlua::PreparedStates::ofProcess();
    states.clear();
    qierr::Status status;
    XlatorInterface* xlators[2];
    for (XlatorInterface*& xlator : xlators) {
        xlator = qixlatorlua::createLuaXlator("mxlator_qitrmc",
                                              qixlator::localRegistrations().next->registrationInfo,
                                              LuaRuntime::Prepared, &status);
        ASSERT_NE(xlator, nullptr) << status.json;
    }
    for (XlatorInterface* xlator : xlators) {
        xlator->destroy(xlator);
    }
    EXPECT_GT(states.size(), 2u * 128 * 1024);
    EXPECT_LE(states.size() + qixlatorlua::BytecodeCache::ofEmbeddedFiles()->size() +
                  qixlator::KeptSearches::maximumSize,
              1024u * 1024);
}

// The first translation of a process sets up the state that the others copy.
TEST_F(MemoryFaultTest, TheFirstTranslationSurvivesEachSingleFailure) {
    const auto translateFirst = [this] {
        translateWholly();
        qixlatorlua::PreparedStates::ofProcess().clear();
    };
    qixlatorlua::PreparedStates::ofProcess().clear();
    EXPECT_LT(100u, failEach(translateFirst, 1));
    EXPECT_EQ(text.find("Text.\n\nReserved by Sessions: a, b\n"), 0u) << text;
}

TEST_F(MemoryFaultTest, TheFirstTranslationSurvivesTheEndOfAllMemoryAtEachPoint) {
    const auto translateFirst = [this] {
        translateWholly();
        qixlatorlua::PreparedStates::ofProcess().clear();
    };
    qixlatorlua::PreparedStates::ofProcess().clear();
    EXPECT_LT(100u, failEach(translateFirst, FaultyAllocator::never));
}

TEST_F(MemoryFaultTest, LackOfMemoryIsReportedAsTheInterpretersFailure) {
    FaultyAllocator::failAt(2000, FaultyAllocator::never);
    qierr::Status failure;
    EXPECT_EQ(
        qixlatorlua::createLuaXlator("n", qixlator::localRegistrations().next->registrationInfo,
                                     LuaRuntime::Plain, &failure),
        nullptr);
    EXPECT_TRUE(FaultyAllocator::hasFailed());
    EXPECT_EQ(failure.code, -52003);
}

TEST_F(MemoryFaultTest, AStateThatCannotBeMadeIsReported) {
    qixlatorlua::PreparedStates::ofProcess().clear();
    for (const LuaRuntime runtime : {LuaRuntime::Plain, LuaRuntime::Fast, LuaRuntime::Prepared}) {
        // The first request is for the translator itself.
        FaultyAllocator::failAt(1);
        qierr::Status failure;
        EXPECT_EQ(qixlatorlua::createLuaXlator("n", "{}", runtime, &failure), nullptr);
        FaultyAllocator::succeed();
        EXPECT_EQ(failure.code, -52000);
        ASSERT_NE(failure.json, nullptr);
        EXPECT_NE(std::string::npos,
                  std::string(failure.json)
                      .find("\"qixlatorlua_debug\":{\"debug\":\"failed to create lua state\"}"))
            << failure.json;
    }
}

// Every block of the interpreter is a request in the plain runtime, which the service does not use:
// thousands, so in several parts, and in longer steps; our own requests are among those above.
constexpr int parts = 4;
const int plainStep = isSeriesWhole() ? 1 : 4 * failureStep;
class PlainMemoryFaultTest : public MemoryFaultTest, public testing::WithParamInterface<int> {};

INSTANTIATE_TEST_SUITE_P(Parts, PlainMemoryFaultTest, testing::Range(0, parts));

TEST_P(PlainMemoryFaultTest, ATranslatorSurvivesEachSingleFailure) {
    EXPECT_LT(1000u,
              failEach([this] { askTranslator(LuaRuntime::Plain); }, 1,
                       static_cast<std::uint64_t>(GetParam() * plainStep), parts * plainStep));
}

}  // namespace
