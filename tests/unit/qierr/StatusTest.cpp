#include "qierr/Status.h"

#include "Records.h"

using qierr_test::expectBuffer;
using qierr_test::MeteredStatus;
using qierr_test::somewhere;
using qierr_test::somewhereText;
using qierr_test::textOf;

TEST(Status, StartsAsSuccessWithoutText) {
    const qierr::Status status;
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(status.capacity, 0u);
    EXPECT_EQ(status.reallocJson, qierr_Status_defaultRealloc);
    EXPECT_EQ(status.json, nullptr);
}

TEST(Status, FreesItsTextThroughItsOwnFunction) {
    static int frees = 0;
    frees = 0;
    const auto counting = [](qierr_Status* status, std::uint32_t size) -> std::int32_t {
        frees += size == 0 ? 1 : 0;
        return qierr_Status_defaultRealloc(status, size);
    };
    {
        qierr::Status empty;
        empty.reallocJson = counting;
    }
    EXPECT_EQ(frees, 0);
    {
        qierr::Status filled;
        filled.reallocJson = counting;
        qierr_Status_setJson(&filled, nullptr);
    }
    EXPECT_EQ(frees, 1);
}

TEST(SetCode, FollowsPrecedence) {
    struct {
        std::int32_t current, next, result, code;
    } const rules[] = {
        {0, 0, 0, 0},   {0, 5, 1, 5},    {0, -5, 1, -5},  {-1, 0, 0, -1},
        {-1, 5, 0, -1}, {-1, -2, 0, -1}, {3, 0, 0, 3},    {3, 5, 0, 3},
        {3, -5, 1, -5}, {3, 3, 0, 3},    {-1, -1, 0, -1}, {3, 1, 0, 3},
    };
    for (const auto& rule : rules) {
        SCOPED_TRACE(std::to_string(rule.current) + " then " + std::to_string(rule.next));
        qierr::Status status;
        status.code = rule.current;
        EXPECT_EQ(qierr_Status_setCode(&status, rule.next), rule.result);
        EXPECT_EQ(status.code, rule.code);
        EXPECT_EQ(status.json, nullptr);
        EXPECT_EQ(status.capacity, 0u);
    }
}

TEST(SetCode, ErrorDropsTheDetailsOfAWarning) {
    qierr::Status status;
    qierr_Status_setCodeAt(&status, 5, somewhere);
    EXPECT_EQ(textOf(status), somewhereText);
    EXPECT_EQ(qierr_Status_setCode(&status, -1), 1);
    EXPECT_EQ(status.code, -1);
    expectBuffer(status, 512, "{}");
}

TEST(SetCode, KeptCodeKeepsItsText) {
    qierr::Status status;
    qierr_Status_setCodeAt(&status, -1, somewhere);
    EXPECT_EQ(qierr_Status_setCode(&status, -2), 0);
    EXPECT_EQ(textOf(status), somewhereText);
}

TEST(SetCodeAt, WritesThePosition) {
    qierr::Status status;
    bool written = false;
    EXPECT_EQ(qierr_Status_setCodeAt(&status, -250800, somewhere, &written), 1);
    EXPECT_TRUE(written);
    EXPECT_EQ(status.code, -250800);
    expectBuffer(status, 512, somewhereText);
}

TEST(SetCodeAt, LeavesOutANullComponent) {
    qierr::Status status;
    qierr_Status_setCodeAt(&status, -1, {"f", -3, nullptr, nullptr});
    EXPECT_EQ(textOf(status), "{\"file\":\"f\",\"line\":-3}");
}

TEST(SetCodeAt, SecondFailureIsNotRecorded) {
    qierr::Status status;
    qierr_Status_setCodeAt(&status, -1, somewhere);
    bool written = false;
    EXPECT_EQ(qierr_Status_setCodeAt(&status, -2, {"src/b.cpp", 7, nullptr, nullptr}, &written), 0);
    EXPECT_TRUE(written);
    EXPECT_EQ(status.code, -1);
    EXPECT_EQ(textOf(status), somewhereText);
}

TEST(SetCodeAt, SuccessAfterSuccessAllocatesNothing) {
    qierr::Status status;
    EXPECT_EQ(qierr_Status_setCodeAt(&status, 0, somewhere), 0);
    EXPECT_EQ(status.json, nullptr);
}

TEST(SetCodeAt, CodeIsSetEvenIfTheTextCannotBeWritten) {
    MeteredStatus status(0);
    bool written = true;
    EXPECT_EQ(qierr_Status_setCodeAt(&status, -1, somewhere, &written), 1);
    EXPECT_FALSE(written);
    EXPECT_EQ(status.code, -1);
    EXPECT_EQ(status.json, nullptr);
}

TEST(SetCodeAt, FlagIsSetByALaterFailureToo) {
    MeteredStatus status(1);
    bool written = true;
    const std::string file(600, 'f');
    EXPECT_EQ(qierr_Status_setCodeAt(&status, -1, {file.c_str(), 1, nullptr, nullptr}, &written),
              1);
    EXPECT_FALSE(written);
    EXPECT_EQ(status.code, -1);
    expectBuffer(status, 512, "{}");
}

TEST(SetCodeNamed, WritesTheNameFirst) {
    qierr::Status status;
    bool written = false;
    EXPECT_EQ(qierr_Status_setCodeNamed(&status, qiapalerr_memoryFull, somewhere, &written), 1);
    EXPECT_TRUE(written);
    EXPECT_EQ(status.code, -52000);
    EXPECT_EQ(textOf(status),
              "{\"error_constant\":\"qiapalerr_memoryFull\",\"file\":\"src/a.cpp\",\"line\":12,"
              "\"component\":\"qitrmcsvc\"}");
    EXPECT_EQ(qierr_Status_setCodeNamed(&status, -52003, somewhere), 0);
}

TEST(Take, MovesTheTextBetweenRecordsWithTheSameAllocation) {
    qierr::Status source, target;
    qierr_Status_setCodeAt(&source, -7, somewhere);
    const char* buffer = source.json;
    bool written = false;
    EXPECT_EQ(qierr_Status_take(&target, &source, &written), 1);
    EXPECT_TRUE(written);
    EXPECT_EQ(target.code, -7);
    EXPECT_EQ(target.json, buffer);
    expectBuffer(target, 512, somewhereText);
    EXPECT_EQ(source.code, -7);
    EXPECT_EQ(source.capacity, 0u);
    EXPECT_EQ(source.json, nullptr);
}

TEST(Take, FreesTheTextOfASupersededWarning) {
    qierr::Status source, target;
    qierr_Status_setCodeAt(&target, 4, somewhere);
    source.code = -7;
    EXPECT_EQ(qierr_Status_take(&target, &source), 1);
    EXPECT_EQ(target.code, -7);
    EXPECT_EQ(target.json, nullptr);
    EXPECT_EQ(target.capacity, 0u);
}

TEST(Take, ChangesNeitherWhenTheFirstErrorIsKept) {
    qierr::Status source, target;
    qierr_Status_setCodeAt(&source, -7, somewhere);
    target.code = -1;
    bool written = false;
    EXPECT_EQ(qierr_Status_take(&target, &source, &written), 0);
    EXPECT_TRUE(written);
    EXPECT_EQ(target.code, -1);
    EXPECT_EQ(target.json, nullptr);
    EXPECT_EQ(textOf(source), somewhereText);
}

TEST(Take, CopiesTheTextOfARecordWithAnotherAllocation) {
    MeteredStatus source;
    qierr::Status target;
    qierr_Status_setCodeAt(&source, -7, somewhere);
    EXPECT_EQ(qierr_Status_take(&target, &source), 1);
    expectBuffer(target, 512, somewhereText);
    EXPECT_EQ(textOf(source), somewhereText);
}

TEST(Take, ReportsAFailedCopy) {
    qierr::Status source;
    MeteredStatus target(0);
    qierr_Status_setCodeAt(&source, -7, somewhere);
    bool written = true;
    EXPECT_EQ(qierr_Status_take(&target, &source, &written), 1);
    EXPECT_FALSE(written);
    EXPECT_EQ(target.code, -7);
    EXPECT_EQ(target.json, nullptr);
    EXPECT_EQ(textOf(source), somewhereText);
}

TEST(Take, RecordTakenFromItselfIsUnchanged) {
    qierr::Status status;
    qierr_Status_setCodeAt(&status, -7, somewhere);
    EXPECT_EQ(qierr_Status_take(&status, &status), 0);
    EXPECT_EQ(textOf(status), somewhereText);
}

TEST(Merge, CopiesBetweenRecordsWithTheSameAllocation) {
    qierr::Status source, target;
    qierr_Status_setCodeAt(&source, -7, somewhere);
    EXPECT_EQ(qierr_Status_merge(&target, &source), 1);
    EXPECT_EQ(target.code, -7);
    EXPECT_NE(target.json, source.json);
    expectBuffer(target, 512, somewhereText);
    expectBuffer(source, 512, somewhereText);
}

TEST(Merge, SourceWithoutTextAddsNone) {
    qierr::Status source, target;
    source.code = -7;
    EXPECT_EQ(qierr_Status_merge(&target, &source), 1);
    EXPECT_EQ(target.code, -7);
    EXPECT_EQ(target.json, nullptr);
}

TEST(Merge, SupersededWarningLosesItsText) {
    qierr::Status source, target;
    source.code = -7;
    qierr_Status_setCodeAt(&target, 4, somewhere);
    EXPECT_EQ(qierr_Status_merge(&target, &source), 1);
    EXPECT_EQ(textOf(target), "{}");
}

TEST(Merge, FollowsPrecedence) {
    qierr::Status source, target;
    qierr_Status_setCodeAt(&source, -7, somewhere);
    target.code = -1;
    EXPECT_EQ(qierr_Status_merge(&target, &source), 0);
    EXPECT_EQ(target.code, -1);
    EXPECT_EQ(target.json, nullptr);
}

TEST(Merge, ReportsAFailedCopy) {
    qierr::Status source;
    MeteredStatus target(0);
    qierr_Status_setCodeAt(&source, -7, somewhere);
    bool written = true;
    EXPECT_EQ(qierr_Status_merge(&target, &source, &written), 1);
    EXPECT_FALSE(written);
    EXPECT_EQ(target.code, -7);
}

TEST(Assign, IgnoresPrecedence) {
    qierr::Status source, target;
    qierr_Status_setCodeAt(&target, -7, somewhere);
    EXPECT_EQ(qierr_Status_assign(&target, &source), 1);
    EXPECT_EQ(target.code, 0);
    EXPECT_EQ(target.json, nullptr);
    EXPECT_EQ(target.capacity, 0u);
}

TEST(Assign, CopiesTheText) {
    qierr::Status source, target;
    qierr_Status_setCodeAt(&source, 3, somewhere);
    qierr_Status_setCodeAt(&target, -7, {"other", 1, nullptr, nullptr});
    EXPECT_EQ(qierr_Status_assign(&target, &source), 1);
    EXPECT_EQ(target.code, 3);
    expectBuffer(target, 512, somewhereText);
    expectBuffer(source, 512, somewhereText);
}

TEST(Assign, FailedCopyKeepsCodeAndText) {
    qierr::Status source;
    MeteredStatus target(1);
    qierr_Status_setCodeAt(&target, -7, somewhere);
    source.code = -9;
    qierr_Status_setJson(&source, ("[\"" + std::string(600, 'x') + "\"]").c_str());
    EXPECT_EQ(qierr_Status_assign(&target, &source), 0);
    EXPECT_EQ(target.code, -7);
    expectBuffer(target, 512, somewhereText);
}

TEST(Assign, RecordAssignedToItselfIsUnchanged) {
    qierr::Status status;
    qierr_Status_setCodeAt(&status, -7, somewhere);
    EXPECT_EQ(qierr_Status_assign(&status, &status), 1);
    EXPECT_EQ(status.code, -7);
    expectBuffer(status, 512, somewhereText);
}
