#include <gtest/gtest.h>

#include <stdexcept>
#include <string>

#include "qitrmcsharedcmn/Exceptions.h"

using namespace nQITRMCSHAREDCMN100;

namespace {

constexpr qierr_SourcePosition inDriver{"driver.c", 1, nullptr, nullptr};

void driverCall(std::int32_t code, qierr_Status* status) {
    qierr_Status_setCodeAt(status, code, inDriver);
}

}  // namespace

TEST(ThrowingStatus, DoesNotThrowOnSuccess) {
    EXPECT_NO_THROW({ ThrowingStatus status; });
}

TEST(ThrowingStatus, DropsAWarning) {
    EXPECT_NO_THROW({
        ThrowingStatus status;
        driverCall(5, &status);
    });
}

TEST(ThrowingStatus, ThrowsAnErrorWithItsText) {
    bool reached = false;
    try {
        {
            ThrowingStatus status;
            driverCall(-250900, &status);
        }
        reached = true;
    } catch (const qierr::Exception& error) {
        EXPECT_EQ(error.status()->code, -250900);
        EXPECT_STREQ(error.what(), "{\"file\":\"driver.c\",\"line\":1}");
    }
    EXPECT_FALSE(reached);
}

TEST(ThrowingStatus, DropsAnErrorWhileAnExceptionIsInFlight) {
    try {
        ThrowingStatus status;
        driverCall(-250900, &status);
        throw std::runtime_error("the first failure");
    } catch (const std::runtime_error& error) {
        EXPECT_STREQ(error.what(), "the first failure");
    }
}

TEST(ThrowingStatus, ThrowsFromInsideAHandler) {
    // A caught exception is no longer in flight.
    try {
        throw std::runtime_error("handled");
    } catch (const std::runtime_error&) {
        EXPECT_THROW(
            {
                ThrowingStatus status;
                driverCall(-1, &status);
            },
            qierr::Exception);
    }
}

TEST(ThrowingStatus, DropsAnErrorInADestructorThatRunsWhileUnwinding) {
    struct Cleanup {
        ~Cleanup() {
            ThrowingStatus status;
            driverCall(-1, &status);
        }
    };
    EXPECT_THROW(
        {
            Cleanup cleanup;
            throw std::logic_error("unwinding");
        },
        std::logic_error);
}
