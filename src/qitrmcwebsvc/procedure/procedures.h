#pragma once

#include <utility>

#include "qitrmcwebsvc/procedure/Procedure.h"

namespace nQITRMCWEBSVC100 {

// The procedure classes, one for each row of methods.def. Each class implements run() in the source
// file of its name.
#define QITRMC_METHOD(name, Class, schema)                                          \
    class Class final : public Procedure {                                          \
      public:                                                                       \
        using Procedure::Procedure;                                                 \
                                                                                    \
      private:                                                                      \
        void run(const JsonValue& params, SingleResponse& response) const override; \
    };
#include "qitrmcwebsvc/methods.def"

}  // namespace nQITRMCWEBSVC100
