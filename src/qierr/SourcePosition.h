#pragma once

#include <cstdint>

// The source position where a failure was detected. The texts are not copied and must outlive the
// record.
struct qierr_SourcePosition {
    const char* file;
    std::int32_t line;
    const char* component;      // may be null
    const char* errorConstant;  // symbolic name of the code; read by qierr_Status_setCodeNamed only
};

// The position of this line in the service.
#define QITRMC_HERE (qierr_SourcePosition{__FILE__, __LINE__, "qitrmcsvc", nullptr})

// The position of this line, with the symbolic name of the code that is about to be set.
#define QIERR_HERE_NAMED(errorConstant) \
    (qierr_SourcePosition{__FILE__, __LINE__, "qitrmcsvc", (errorConstant)})
