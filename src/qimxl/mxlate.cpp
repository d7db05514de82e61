#include "qixlator/Registration.h"
#include "qixlatorlua/LuaXlator.h"

// Folder qimxl: the translator of the service's own statuses, in Lua.
//
// This file registers that translator, for the sessions of this program and for other programs.

namespace {

constexpr const char* xlatorName = "mxlator_qitrmc";

#define QIMXL_DRIVER_NAME "qitrmc"

constexpr const char* registrationText =
    "{\"qixlatorlua_xlator\":\"mxlator\",\"qixlatorlua_settings\":{\"driverName\":"
    "\"" QIMXL_DRIVER_NAME
    "\",\"qiSharedErrorsDir\":\"$_qiShared32Dir/errors\","
    "\"MIErrorsDir\":\"$_qiShared32Dir/mierrors\"}}";

// A session of this program lasts for one translation.
XlatorInterface* createLocal(const char* name, const char* registrationInfo, qierr_Status* status) {
    return qixlatorlua::createLuaXlator(name, registrationInfo, qixlatorlua::LuaRuntime::Prepared,
                                        status);
}

XlatorInterface* createExported(const char* name, const char* registrationInfo,
                                qierr_Status* status) {
    return qixlatorlua::createLuaXlator(name, registrationInfo, qixlatorlua::LuaRuntime::Fast,
                                        status);
}

const qixlator::XlatorRegistration localRegistration(qixlator::localRegistrations(), xlatorName,
                                                     registrationText, createLocal);
const qixlator::XlatorRegistration exportedRegistration(qixlator::exportedRegistrations(),
                                                        xlatorName, nullptr, createExported);

}  // namespace
