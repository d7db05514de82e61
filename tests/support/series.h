#pragma once

#include <cstdlib>
#include <string>

#include "support/sanitizers.h"

#if defined(__arm__)
constexpr bool isEmulated = true;
#else
constexpr bool isEmulated = false;
#endif
#if defined(QITRMC_ADDRESS_SANITIZER)
constexpr bool hasAddressSanitizer = true;
#else
constexpr bool hasAddressSanitizer = false;
#endif

// The release build tries every case of a long series. The emulator for ARM takes ten times as
// long, the address sanitizer three times: they get one in seven and one in five, and all if
// QITRMC_SERIES is "whole". The numbers have no common factor with the lengths of rows of cases, so
// each column is tried.
inline bool isSeriesWhole() {
    const char* series = std::getenv("QITRMC_SERIES");
    return series != nullptr && std::string(series) == "whole";
}

// By how many allocations, or other places to fail, a test moves on that lets one after another
// fail.
inline const int failureStep = isSeriesWhole() ? 1 : isEmulated ? 7 : hasAddressSanitizer ? 5 : 1;
