#include "qitrmcwebsvc/ProcedureFactory.h"

#include <utility>

#include "embedded/EmbeddedFiles.h"
#include "qitrmcwebsvc/SchemaValidator.h"
#include "qitrmcwebsvc/SessionManager.h"
#include "qitrmcwebsvc/procedure/AbortSession.h"
#include "qitrmcwebsvc/procedure/CloseSession.h"
#include "qitrmcwebsvc/procedure/CommitNvmemAreas.h"
#include "qitrmcwebsvc/procedure/CommitProperties.h"
#include "qitrmcwebsvc/procedure/ConnectToDevices.h"
#include "qitrmcwebsvc/procedure/DisconnectFromDevices.h"
#include "qitrmcwebsvc/procedure/ExecuteCommand.h"
#include "qitrmcwebsvc/procedure/GetChassisIpOrHostname.h"
#include "qitrmcwebsvc/procedure/GetCommandInformation.h"
#include "qitrmcwebsvc/procedure/GetCommandList.h"
#include "qitrmcwebsvc/procedure/GetDevicePropertyList.h"
#include "qitrmcwebsvc/procedure/GetModuleName.h"
#include "qitrmcwebsvc/procedure/GetNvmemBytes.h"
#include "qitrmcwebsvc/procedure/GetProperty.h"
#include "qitrmcwebsvc/procedure/GetPropertyInformation.h"
#include "qitrmcwebsvc/procedure/GetSessionPropertyList.h"
#include "qitrmcwebsvc/procedure/InitializeSession.h"
#include "qitrmcwebsvc/procedure/ReadRegister.h"
#include "qitrmcwebsvc/procedure/RenameChassisAndAllConnectedModules.h"
#include "qitrmcwebsvc/procedure/RenameDevice.h"
#include "qitrmcwebsvc/procedure/ReserveDevices.h"
#include "qitrmcwebsvc/procedure/ResetDevices.h"
#include "qitrmcwebsvc/procedure/SetNvmemBytes.h"
#include "qitrmcwebsvc/procedure/SetProperty.h"
#include "qitrmcwebsvc/procedure/UnreserveDevices.h"
#include "qitrmcwebsvc/procedure/WriteRegister.h"

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
