#pragma once

#include <memory>

#include "qitrmcwebsvc/IProcedure.h"

namespace nQITRMCWEBSVC100 {

// Creates the single object of each procedure class: one function for each row of methods.def.
class IProcedureFactory {
  public:
    virtual ~IProcedureFactory() = default;

#define QITRMC_METHOD(name, Class, schema) virtual std::shared_ptr<IProcedure> make##Class() = 0;
#include "qitrmcwebsvc/methods.def"
};

// One row of the method table.
struct Method {
    const char* name;  // compared exactly, case included
    std::shared_ptr<IProcedure> (IProcedureFactory::*make)();
};

constexpr Method methodTable[] = {
#define QITRMC_METHOD(name, Class, schema) {name, &IProcedureFactory::make##Class},
#include "qitrmcwebsvc/methods.def"
};

}  // namespace nQITRMCWEBSVC100
