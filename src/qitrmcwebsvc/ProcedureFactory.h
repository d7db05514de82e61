#pragma once

#include "qitrmcwebsvc/IProcedureFactory.h"
#include "qitrmcwebsvc/ISessionManager.h"

namespace nQITRMCWEBSVC100 {

// Creates the procedures, each with its own validator. All of them share one session manager, which
// the factory creates. Throws InternalError for a schema that does not compile.
class ProcedureFactory : public IProcedureFactory {
  public:
    ProcedureFactory();

#define QITRMC_METHOD(name, Class, schema) std::shared_ptr<IProcedure> make##Class() override;
#include "qitrmcwebsvc/methods.def"

  private:
    template <typename Class>
    std::shared_ptr<IProcedure> makeProcedure(const char* schemaFile) const;

    std::shared_ptr<ISessionManager> sessionManager;
};

}  // namespace nQITRMCWEBSVC100
