#pragma once

#include "qitrmcwebsvc/IProcedureFactory.h"
#include "qitrmcwebsvc/ISessionManager.h"

namespace nQITRMCWEBSVC100 {

// Gives each procedure a validator of its own and a share of the one session manager, which the
// factory makes. Throws InternalError for a schema that does not compile.
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
