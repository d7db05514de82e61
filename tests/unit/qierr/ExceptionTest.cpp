#include "qierr/Exception.h"

#include "Records.h"

using qierr_test::MeteredStatus;
using qierr_test::somewhere;
using qierr_test::somewhereText;
using qierr_test::textOf;

TEST(Exception, TakesTheStatusItIsBuiltFrom) {
    qierr::Status status;
    qierr_Status_setCodeAt(&status, -7, somewhere);
    const qierr::Exception error(&status);
    EXPECT_EQ(error.status()->code, -7);
    EXPECT_STREQ(error.what(), somewhereText);
    EXPECT_EQ(status.json, nullptr);
    EXPECT_EQ(status.code, -7);
}

TEST(Exception, WhatIsEmptyWithoutText) {
    qierr::Status status;
    status.code = -7;
    const qierr::Exception error(&status);
    EXPECT_STREQ(error.what(), "");
    EXPECT_STREQ(static_cast<const qierr::ExceptionBase&>(error).what(), "");
    EXPECT_STREQ(static_cast<const std::exception&>(error).what(), "");
}

TEST(Exception, CopyTakesOverTheText) {
    qierr::Status status;
    qierr_Status_setCodeAt(&status, -7, somewhere);
    const qierr::Exception first(&status);
    const qierr::Exception second(first);
    EXPECT_EQ(first.status()->code, -7);
    EXPECT_STREQ(first.what(), "");
    EXPECT_EQ(second.status()->code, -7);
    EXPECT_STREQ(second.what(), somewhereText);
}

TEST(Exception, CopiesTheTextOfAForeignRecord) {
    MeteredStatus status;
    qierr_Status_setCodeAt(&status, -7, somewhere);
    const qierr::Exception error(&status);
    EXPECT_STREQ(error.what(), somewhereText);
    EXPECT_EQ(error.status()->reallocJson, qierr_Status_defaultRealloc);
    EXPECT_EQ(textOf(status), somewhereText);
}

TEST(Exception, CopiesWithoutThrowing) {
    static_assert(std::is_nothrow_copy_constructible_v<qierr::Exception>);
    static_assert(!std::is_copy_assignable_v<qierr::Exception>);
}

TEST(Exception, IsCaughtByEitherBase) {
    qierr::Status status;
    status.code = -7;
    EXPECT_THROW(throw qierr::Exception(&status), qierr::ExceptionBase);
    EXPECT_THROW(throw qierr::Exception(&status), std::exception);
    // The first matching handler is used.
    try {
        throw qierr::Exception(&status);
    } catch (const std::exception& error) {
        EXPECT_STREQ(error.what(), "");
    } catch (const qierr::ExceptionBase&) {
        ADD_FAILURE();
    }
}
