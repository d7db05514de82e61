#include "qitrmcwebsvc/ProcedureFactory.h"

#include <utility>

#include "embedded/EmbeddedFiles.h"
#include "qitrmcwebsvc/SchemaValidator.h"
#include "qitrmcwebsvc/SessionManager.h"
#include "qitrmcwebsvc/procedure/procedures.h"

namespace nQITRMCWEBSVC100 {

ProcedureFactory::ProcedureFactory() : sessionManager(std::make_shared<SessionManager>()) {}

template <typename Class>
std::shared_ptr<IProcedure> ProcedureFactory::makeProcedure(const char* schemaFile) const {
    std::shared_ptr<ISchemaValidator> validator =
        std::make_shared<SchemaValidator>(embeddedText(schemaFile));
    return std::make_shared<Class>(sessionManager, std::move(validator));
}

#define QITRMC_METHOD(name, Class, schema)                        \
    std::shared_ptr<IProcedure> ProcedureFactory::make##Class() { \
        return makeProcedure<Class>(schema);                      \
    }
#include "qitrmcwebsvc/methods.def"

}  // namespace nQITRMCWEBSVC100
