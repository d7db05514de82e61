#include "qixlator/exported.h"

#include "qixlator/Registration.h"
#include "qixlator/reportFailure.h"

// In the same source file as the exported function, so that the linker includes that function in
// every program that registers a translator for others.
qixlator::XlatorRegistration& qixlator::exportedRegistrations() {
    static XlatorRegistration list;
    return list;
}

XlatorInterface* qixlator_exported_create(const char* name, const char* registrationInfo,
                                          qierr_Status* status) {
    if (status->code < 0) {
        return nullptr;
    }
    const qixlator::XlatorRegistration* entry = qixlator::exportedRegistrations().find(name);
    if (entry != nullptr) {
        return entry->create(name, registrationInfo, status);
    }
    qierr_Writer writer = qixlator::reportFailure(status, qiapalerr_invalidParameter,
                                                  QIERR_HERE_NAMED("qiapalerr_invalidParameter"));
    writer = qierr_Writer_addString(writer, "qixlator_exported", "could not find xlator");
    writer = qierr_Writer_addString(writer, "name", name);
    qierr_Writer_addString(writer, "registrationInfo", registrationInfo);
    return nullptr;
}
