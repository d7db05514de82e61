#include "qitrmcsharedcmn/Exceptions.h"

#include <gtest/gtest.h>

#include <new>
#include <stdexcept>
#include <string>

using namespace nQITRMCSHAREDCMN100;

namespace {

constexpr qierr_SourcePosition here{"src/x.cpp", 3, "qitrmcsvc", nullptr};
const char* const hereText = "{\"file\":\"src/x.cpp\",\"line\":3,\"component\":\"qitrmcsvc\"}";

std::string textOf(const qierr_Status& status) {
    return status.json != nullptr ? status.json : "(null)";
}

// What captureCurrentException stores for a thrown object.
template <typename Thrown>
void capture(const Thrown& thrown, qierr_Status* status) {
    try {
        throw Thrown(thrown);
    } catch (const std::exception& caught) {
        captureCurrentException(caught, status);
    }
}

// The text of a capture with its line number removed.
std::string withoutLine(const std::string& text) {
    const std::string mark = "\"line\":";
    const std::size_t begin = text.find(mark) + mark.size();
    const std::size_t end = text.find_first_not_of("0123456789", begin);
    EXPECT_GT(end, begin);
    return text.substr(0, begin) + text.substr(end);
}

const char* const capturedBegin =
    "{\"file\":\"src/qitrmcsharedcmn/Exceptions.h\",\"line\":,\"component\":\"qitrmcsvc\"";

}  // namespace

TEST(BasicError, CarriesCodeAndPosition) {
    const BasicError error(-250828, here);
    EXPECT_EQ(error.status()->code, -250828);
    EXPECT_STREQ(error.what(), hereText);
}

TEST(BasicError, IsAnInternalErrorWithoutACode) {
    const BasicError error(here);
    EXPECT_EQ(error.status()->code, -250800);
    EXPECT_STREQ(error.what(), hereText);
}

TEST(BasicError, WhatIsNullWithoutDetails) {
    const BasicError error(-250828, here);
    const BasicError copy(error);
    EXPECT_EQ(error.what(), nullptr);
    EXPECT_EQ(static_cast<const std::exception&>(error).what(), nullptr);
    EXPECT_EQ(static_cast<const qierr::ExceptionBase&>(error).what(), nullptr);
}

TEST(BasicError, CopyTakesOverTheTextAndKeepsTheCode) {
    const BasicError first(-250828, here);
    const BasicError second(first);
    EXPECT_EQ(first.status()->code, -250828);
    EXPECT_EQ(first.status()->json, nullptr);
    EXPECT_EQ(first.status()->capacity, 0u);
    EXPECT_EQ(second.status()->code, -250828);
    EXPECT_STREQ(second.what(), hereText);
}

TEST(BasicError, ThrownLocalKeepsItsDetails) {
    try {
        BasicError error(-250828, here);
        addUsageString(error.details(), "tag", "value");
        throw error;
    } catch (const BasicError& error) {
        EXPECT_STREQ(error.what(),
                     "{\"file\":\"src/x.cpp\",\"line\":3,\"component\":\"qitrmcsvc\","
                     "\"translator\":\"mxlator_qitrmc\",\"translator_info\":{\"ordered_data\":["
                     "{\"type\":\"usage\",\"usage\":\"tag\",\"value\":\"value\","
                     "\"value_type\":\"string\"}]}}");
    }
}

TEST(BasicError, IsCaughtByEitherBase) {
    EXPECT_THROW(throw BasicError(here), qierr::ExceptionBase);
    EXPECT_THROW(throw BasicError(here), std::exception);
}

TEST(InternalError, CarriesItsComment) {
    const InternalError error("no such \"kind\"", here);
    EXPECT_EQ(error.status()->code, -250800);
    const char* text =
        "{\"file\":\"src/x.cpp\",\"line\":3,\"component\":\"qitrmcsvc\","
        "\"translator\":\"mxlator_qitrmc\",\"translator_info\":{\"ordered_data\":["
        "{\"type\":\"comment\",\"comment\":\"no such \\\"kind\\\"\"}]}}";
    EXPECT_STREQ(error.what(), text);
    const InternalError copy(error);
    EXPECT_STREQ(copy.what(), text);
    EXPECT_EQ(error.what(), nullptr);
    EXPECT_EQ(error.status()->code, -250800);
}

TEST(InternalError, IsCaughtByEitherBase) {
    EXPECT_THROW(throw InternalError("c", here), qierr::ExceptionBase);
    EXPECT_THROW(throw InternalError("c", here), std::exception);
}

TEST(CopyOfAnException, CannotThrow) {
    static_assert(std::is_nothrow_copy_constructible_v<BasicError>);
    static_assert(std::is_nothrow_copy_constructible_v<InternalError>);
}

TEST(CaptureCurrentException, TakesACarriedStatus) {
    qierr::Status status;
    capture(BasicError(-250828, here), &status);
    EXPECT_EQ(status.code, -250828);
    EXPECT_EQ(textOf(status), hereText);

    qierr::Status internal;
    capture(InternalError("c", here), &internal);
    EXPECT_EQ(internal.code, -250800);

    qierr::Status source, passedOn;
    qierr_Status_setCodeAt(&source, -52005, here);
    capture(qierr::Exception(&source), &passedOn);
    EXPECT_EQ(passedOn.code, -52005);
    EXPECT_EQ(textOf(passedOn), hereText);
}

TEST(CaptureCurrentException, NamesAStandardException) {
    qierr::Status status;
    capture(std::runtime_error("it \"broke\""), &status);
    EXPECT_EQ(status.code, -250800);
    EXPECT_EQ(withoutLine(textOf(status)),
              std::string(capturedBegin) + ",\"std_exception_what\":\"it \\\"broke\\\"\"}");
}

TEST(CaptureCurrentException, AllocationFailureHasNoText) {
    qierr::Status status;
    capture(std::bad_alloc(), &status);
    EXPECT_EQ(status.code, -250801);
    EXPECT_EQ(withoutLine(textOf(status)), std::string(capturedBegin) + "}");
}

TEST(CaptureCurrentException, FirstErrorIsKept) {
    qierr::Status status;
    qierr_Status_setCodeAt(&status, -9, here);
    capture(std::runtime_error("later"), &status);
    capture(std::bad_alloc(), &status);
    capture(BasicError(-250828, here), &status);
    EXPECT_EQ(status.code, -9);
    EXPECT_EQ(textOf(status), hereText);
}

TEST(CaptureCurrentException, WorksWithoutAnyMemory) {
    for (int attempt = 0; attempt < 3; ++attempt) {
        qierr_Status status{0, 0, [](qierr_Status*, std::uint32_t) { return 0; }, nullptr};
        if (attempt == 0) {
            capture(std::bad_alloc(), &status);
        } else if (attempt == 1) {
            capture(std::runtime_error("text"), &status);
        } else {
            capture(BasicError(-250801, here), &status);
        }
        EXPECT_EQ(status.code, attempt == 1 ? -250800 : -250801);
        EXPECT_EQ(status.json, nullptr);
    }
}
