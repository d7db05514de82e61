#include "Records.h"
#include "jsonz/jsonz.h"
#include "unit/FailingAllocation.h"

extern "C" void* __real_calloc(std::size_t count, std::size_t size);

extern "C" void* __wrap_calloc(std::size_t count, std::size_t size) {
    return FailingAllocation::active ? nullptr : __real_calloc(count, size);
}

using qierr_test::MeteredStatus;
using qierr_test::textOf;

// Runs the same report with memory that runs out at each growth in turn: the code is always set,
// the buffer keeps its format and the text stays readable.
TEST(Allocation, FailureAtAnyGrowthLosesDetailsOnly) {
    const std::string filler(700, 'f');
    const std::vector<std::string> many(200, "element of some length");
    const auto report = [&](MeteredStatus& status) {
        qierr_Status_setCodeNamed(&status, -250828, {filler.c_str(), 1, "qitrmcsvc", "name"});
        qierr_Writer writer = qierr_orderedData("T", &status);
        writer = addUsageString(writer, "tag", filler.c_str());
        writer = addUsageStringArray(writer, "tags", many);
        addComment(writer, filler.c_str());
        addUsageUInt32(qierr_orderedData("T", &status), "number", 5);
    };
    MeteredStatus complete;
    report(complete);
    ASSERT_EQ(complete.capacity, 8192u);
    ASSERT_EQ(complete.growths, 5);

    for (int growths = 0; growths < complete.growths; ++growths) {
        SCOPED_TRACE(growths);
        MeteredStatus status(growths);
        report(status);
        EXPECT_EQ(status.code, -250828);
        EXPECT_EQ(status.growths, growths);
        if (growths == 0) {
            EXPECT_EQ(status.json, nullptr);
            continue;
        }
        const std::string text = textOf(status);
        EXPECT_LT(text.size(), textOf(complete).size());
        EXPECT_EQ(jsonz_readValue(status.json, nullptr), status.json + text.size());
        qierr_test::expectBuffer(status, 256u << growths, text);
    }
}

TEST(Allocation, DefaultReallocFailsAndLeavesTheRecord) {
    qierr::Status status;
    qierr_Status_setJson(&status, "[1]");
    const char* buffer = status.json;
    {
        const FailingAllocation failing;
        EXPECT_EQ(qierr_Status_defaultRealloc(&status, 513), 0);
    }
    EXPECT_EQ(status.json, buffer);
    qierr_test::expectBuffer(status, 512, "[1]");
}

TEST(Allocation, CodeIsReportedWithoutAnyMemory) {
    qierr::Status status;
    {
        const FailingAllocation failing;
        qierr_Status_setCodeAt(&status, -250801, qierr_test::somewhere);
        addComment(qierr_orderedData("T", &status), "lost");
    }
    EXPECT_EQ(status.code, -250801);
    EXPECT_EQ(status.json, nullptr);
    EXPECT_EQ(status.capacity, 0u);
}
