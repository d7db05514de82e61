#include "qixlator/exported.h"

#include "qixlator/Registration.h"
#include "qixlator/report.h"

// In one source with the export, so that whoever registers a translator brings the export along.
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
