#include "Border.h"

using namespace simulator;

namespace {

void refuseUnsupported(qierr_Status* status) noexcept {
    withSimulator(status, [](auto&, auto&) { throw Refusal(code::notSupported); });
}

}  // namespace

void nQITRMCAPI100_connectToDevices(nQITRMCAPI100_Session, const char*, double,
                                    qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_disconnectFromDevices(nQITRMCAPI100_Session, const char*, qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_resetDevices(nQITRMCAPI100_Session, const char*, qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_renameDevice(nQITRMCAPI100_Session, const char*, const char*,
                                qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_getDevicePropertyString(nQITRMCAPI100_Session, const char*, const char*, char**,
                                           qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_getSystemPropertyBool(nQITRMCAPI100_Session, const char*, uint8_t*,
                                         qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_getSystemPropertyDouble(nQITRMCAPI100_Session, const char*, double*,
                                           qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_getSystemPropertyUInt64(nQITRMCAPI100_Session, const char*, uint64_t*,
                                           qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_setSystemPropertyBool(nQITRMCAPI100_Session, const char*, uint8_t,
                                         qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_setSystemPropertyDouble(nQITRMCAPI100_Session, const char*, double,
                                           qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_getSessionPropertyDouble(nQITRMCAPI100_Session, const char*, double*,
                                            qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_setSessionPropertyDouble(nQITRMCAPI100_Session, const char*, double,
                                            qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_setSessionPropertyStringArray(nQITRMCAPI100_Session, const char*,
                                                 const char* const*, uint32_t,
                                                 qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_getGenericPropertyBool(nQITRMCAPI100_Session, const char*, const char*, uint8_t*,
                                          qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_getGenericPropertyDouble(nQITRMCAPI100_Session, const char*, const char*,
                                            double*, qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_getGenericPropertyInt32(nQITRMCAPI100_Session, const char*, const char*,
                                           int32_t*, qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_getGenericPropertyInt64(nQITRMCAPI100_Session, const char*, const char*,
                                           int64_t*, qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_getGenericPropertyString(nQITRMCAPI100_Session, const char*, const char*, char**,
                                            qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_getGenericPropertyUInt32(nQITRMCAPI100_Session, const char*, const char*,
                                            uint32_t*, qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_getGenericPropertyUInt64(nQITRMCAPI100_Session, const char*, const char*,
                                            uint64_t*, qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_getGenericPropertyBoolArray(nQITRMCAPI100_Session, const char*, const char*,
                                               uint8_t**, uint32_t*, qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_getGenericPropertyDoubleArray(nQITRMCAPI100_Session, const char*, const char*,
                                                 double**, uint32_t*, qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_getGenericPropertyInt32Array(nQITRMCAPI100_Session, const char*, const char*,
                                                int32_t**, uint32_t*, qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_getGenericPropertyInt64Array(nQITRMCAPI100_Session, const char*, const char*,
                                                int64_t**, uint32_t*, qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_getGenericPropertyUInt32Array(nQITRMCAPI100_Session, const char*, const char*,
                                                 uint32_t**, uint32_t*, qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_getGenericPropertyUInt64Array(nQITRMCAPI100_Session, const char*, const char*,
                                                 uint64_t**, uint32_t*, qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_setGenericPropertyBool(nQITRMCAPI100_Session, const char*, const char*, uint8_t,
                                          qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_setGenericPropertyDouble(nQITRMCAPI100_Session, const char*, const char*, double,
                                            qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_setGenericPropertyInt32(nQITRMCAPI100_Session, const char*, const char*, int32_t,
                                           qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_setGenericPropertyInt64(nQITRMCAPI100_Session, const char*, const char*, int64_t,
                                           qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_setGenericPropertyString(nQITRMCAPI100_Session, const char*, const char*,
                                            const char*, qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_setGenericPropertyUInt32(nQITRMCAPI100_Session, const char*, const char*,
                                            uint32_t, qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_setGenericPropertyUInt64(nQITRMCAPI100_Session, const char*, const char*,
                                            uint64_t, qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_setGenericPropertyBoolArray(nQITRMCAPI100_Session, const char*, const char*,
                                               const uint8_t*, uint32_t, qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_setGenericPropertyDoubleArray(nQITRMCAPI100_Session, const char*, const char*,
                                                 const double*, uint32_t, qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_setGenericPropertyInt32Array(nQITRMCAPI100_Session, const char*, const char*,
                                                const int32_t*, uint32_t, qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_setGenericPropertyInt64Array(nQITRMCAPI100_Session, const char*, const char*,
                                                const int64_t*, uint32_t, qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_setGenericPropertyStringArray(nQITRMCAPI100_Session, const char*, const char*,
                                                 const char* const*, uint32_t,
                                                 qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_setGenericPropertyUInt32Array(nQITRMCAPI100_Session, const char*, const char*,
                                                 const uint32_t*, uint32_t, qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_setGenericPropertyUInt64Array(nQITRMCAPI100_Session, const char*, const char*,
                                                 const uint64_t*, uint32_t, qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_commitPropertiesGeneric(nQITRMCAPI100_Session, const char*,
                                           qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_openDriverDefinedProperty(nQITRMCAPI100_Session, const char*,
                                             nQITRMCAPI100_Property*, qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_openGenericProperty(nQITRMCAPI100_Session, const char*, const char*,
                                       nQITRMCAPI100_Property*, qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_closeProperty(nQITRMCAPI100_Property, qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_getPropertyPropertyInt32(nQITRMCAPI100_Property, const char*, int32_t*,
                                            qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_getPropertyPropertyBool(nQITRMCAPI100_Property, const char*, uint8_t*,
                                           qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_getPropertyPropertyString(nQITRMCAPI100_Property, const char*, char**,
                                             qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_getPropertyPropertyInt32Array(nQITRMCAPI100_Property, const char*, int32_t**,
                                                 uint32_t*, qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_getPropertyPropertyStringArray(nQITRMCAPI100_Property, const char*, char***,
                                                  uint32_t*, qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_executeGenericCommand(nQITRMCAPI100_Session, const char*, const char*, double,
                                         qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_openGenericCommand(nQITRMCAPI100_Session, const char*, const char*,
                                      nQITRMCAPI100_Command*, qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_closeCommand(nQITRMCAPI100_Command, qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_getCommandPropertyString(nQITRMCAPI100_Command, const char*, char**,
                                            qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_readRegisterUInt8(nQITRMCAPI100_Session, const char*, uint32_t, uint8_t*,
                                     qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_readRegisterUInt16(nQITRMCAPI100_Session, const char*, uint32_t, uint16_t*,
                                      qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_readRegisterUInt32(nQITRMCAPI100_Session, const char*, uint32_t, uint32_t*,
                                      qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_readRegisterUInt64(nQITRMCAPI100_Session, const char*, uint32_t, uint64_t*,
                                      qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_writeRegisterUInt8(nQITRMCAPI100_Session, const char*, uint32_t, uint8_t,
                                      qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_writeRegisterUInt16(nQITRMCAPI100_Session, const char*, uint32_t, uint16_t,
                                       qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_writeRegisterUInt32(nQITRMCAPI100_Session, const char*, uint32_t, uint32_t,
                                       qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_writeRegisterUInt64(nQITRMCAPI100_Session, const char*, uint32_t, uint64_t,
                                       qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_getNvmemBytes(nQITRMCAPI100_Session, const char*, uint32_t, uint8_t*, uint32_t,
                                 qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_setNvmemBytes(nQITRMCAPI100_Session, const char*, uint32_t, const uint8_t*,
                                 uint32_t, const char*, const char*, qierr_Status* status) {
    refuseUnsupported(status);
}

void nQITRMCAPI100_commitNvmemGeneric(nQITRMCAPI100_Session, const char*, qierr_Status* status) {
    refuseUnsupported(status);
}
