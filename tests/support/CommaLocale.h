#pragma once

#include <gtest/gtest.h>

#include <clocale>
#include <cstdlib>

#include "support/TestPaths.h"

// While the object exists, the process has a locale with a decimal comma.
class CommaLocale {
  public:
    CommaLocale() {
        setenv("LOCPATH", localesFolder, 1);
        setenv("LC_ALL", "de_DE.UTF-8", 1);
        EXPECT_NE(std::setlocale(LC_ALL, ""), nullptr);
        EXPECT_STREQ(std::localeconv()->decimal_point, ",");
    }
    CommaLocale(const CommaLocale&) = delete;
    CommaLocale& operator=(const CommaLocale&) = delete;
    ~CommaLocale() {
        std::setlocale(LC_ALL, "C");
        unsetenv("LC_ALL");
        unsetenv("LOCPATH");
    }
};
