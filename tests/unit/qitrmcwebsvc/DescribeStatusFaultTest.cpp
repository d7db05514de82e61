#include <gtest/gtest.h>

#include <new>
#include <regex>
#include <set>
#include <string>

#include "qierr/Exception.h"
#include "qierr/Writer.h"
#include "qitrmcwebsvc/describeStatus.h"
#include "qixlator/KeptSearches.h"
#include "qixlatorlua/PreparedStates.h"
#include "support/FaultyAllocator.h"
#include "support/TestRoot.h"
#include "support/cjsonLeak.h"

namespace {

using nQITRMCWEBSVC100::describeStatus;

constexpr const char* details =
    "{\"translator\":\"mxlator_qitrmc\",\"translator_info\":{\"ordered_data\":[{\"type\":\"usage\","
    "\"usage\":\"kUsageTypeName\",\"value\":[\"a name\",\"b\"],\"value_type\":\"string\"}]},"
    "\"nested_error\":[{\"code\":-1,\"translator\":\"mxlator_qitrmc\"},{\"code\":-1}]}";

// The text when no search of a file and no module fails, and the texts when some do.
const char* const wholeText =
    "A text beyond a short string.  Name: a name, b     A text beyond a short string.     A text "
    "beyond a short string.";
const std::regex anyText(
    "(A text beyond a short string\\.|Error description not found)  (Name|kUsageTypeName): "
    "a name, b     (A text beyond a short string\\.|Error description not found)     A text beyond "
    "a short string\\.");

// Makes each allocation of a description fail in turn: those of C++, of the statuses, of the
// interpreter, and of the C library for files and directories.
class DescribeStatusFaultTest : public testing::TestWithParam<std::uint64_t> {
  protected:
    DescribeStatusFaultTest() {
        root.write("/usr/local/qinstal/share/errors/English/a.txt",
                   "<?xml version=\"1.0\"?>\n<qidocument>\n<qierror code=\"-1\">\nA text beyond a "
                   "short string.\n</qierror>\n</qidocument>\n");
        qierr_Status_setCode(&source, -1);
        qierr_Status_setJson(&source, details);
        describeStatus(source);  // what is made once in the process is made now
    }
    ~DescribeStatusFaultTest() override { FaultyAllocator::succeed(); }

    // Describes once with faults from request `number` on. Returns whether there is such a request.
    bool describe(std::uint64_t number, std::uint64_t count) {
        std::string text;
        std::int32_t failure = 0;
        qixlator::KeptSearches::ofProcess().clear();
        FaultyAllocator::failAt(number, count);
        try {
            text = describeStatus(source);
        } catch (const qierr::Exception& error) {
            failure = error.status()->code;
        } catch (const std::bad_alloc&) {
            failure = badAlloc;
        }
        // A search is kept as soon as its files are old enough, which must not be counted.
        qixlator::KeptSearches::ofProcess().clear();
        const bool struck = FaultyAllocator::hasFailed();
        FaultyAllocator::succeed();
        failures.insert(failure);
        if (failure == 0) {
            EXPECT_TRUE(std::regex_match(text, anyText)) << "request " << number << ": " << text;
        }
        if (!struck) {
            EXPECT_EQ(wholeText, text);
        }
        return struck;
    }

    static constexpr std::int32_t badAlloc = -1;

    TestRoot root;
    qierr::Status source;
    std::set<std::int32_t> failures;
};

INSTANTIATE_TEST_SUITE_P(Extents, DescribeStatusFaultTest,
                         testing::Values(std::uint64_t{1}, FaultyAllocator::never),
                         [](const testing::TestParamInfo<std::uint64_t>& extent) {
                             return extent.param == 1 ? "One" : "AllFromThere";
                         });

TEST_P(DescribeStatusFaultTest, EachFaultResultsInATextOrAnException) {
    const std::int64_t blocks = FaultyAllocator::liveBlocks();
    std::uint64_t requests = 0;
    while (describe(requests, GetParam()) && !HasFailure()) {
        EXPECT_EQ(FaultyAllocator::liveBlocks(), blocks) << "request " << requests;
        ++requests;
    }
    EXPECT_LT(50u, requests);
    // Those of C++, of the sessions and texts, of the interpreter, and for the files of the default
    // translator.
    EXPECT_EQ(failures, (std::set<std::int32_t>{badAlloc, -52000, -52003, -52006, 0}));
}

// The first description of a process sets up the state that the others copy.
TEST_P(DescribeStatusFaultTest, EachFaultOfTheFirstOneResultsInATextOrAnException) {
    qixlatorlua::PreparedStates::ofProcess().clear();
    const std::int64_t blocks = FaultyAllocator::liveBlocks();
    std::uint64_t requests = 0;
    while (describe(requests, GetParam()) && !HasFailure()) {
        qixlatorlua::PreparedStates::ofProcess().clear();
        EXPECT_EQ(FaultyAllocator::liveBlocks(), blocks) << "request " << requests;
        ++requests;
    }
    EXPECT_LT(100u, requests);
    EXPECT_EQ(failures, (std::set<std::int32_t>{badAlloc, -52000, -52003, -52006, 0}));
}

}  // namespace
