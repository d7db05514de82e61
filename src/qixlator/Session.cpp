#include "qixlator/Session.h"

#include <dlfcn.h>

#include <utility>

#include "qisysq/qidynlib.h"
#include "qixlator/Registration.h"

namespace qixlator {

void DestroyLocalXlator::operator()(XlatorInterface* xlator) {
    xlator->destroy(xlator);
}

void DestroyExportedXlator::operator()(XlatorInterface* xlator) {
    session->destroyXlatorFn(session->managerSession, xlator);
}

Session::Session(qierr_Status* status) noexcept : destroyExported(this) {
    entries.reserve(4, status);
}

Session::~Session() {
    for (XlatorEntry& entry : entries) {
        (*entry.destroyer)(entry.xlator);
    }
    if (managerLibrary != nullptr) {
        unloadManager();
    }
}

XlatorInterface* Session::find(const char* name, qierr_Status* status) {
    if (status->code < 0) {
        return nullptr;
    }
    XlatorInterface* open = findOpen(name);
    if (open != nullptr) {
        return open;
    }
    const XlatorRegistration* local = localRegistrations().find(name);
    if (local == nullptr) {
        return createExported(name, status);
    }
    XlatorInterface* xlator = local->create(local->name, local->registrationInfo, status);
    return keep(name, xlator, &destroyLocal, status);
}

XlatorInterface* Session::findOpen(const char* name) const {
    for (const XlatorEntry& entry : entries) {
        if (entry.name.equals(name)) {
            return entry.xlator;
        }
    }
    return nullptr;
}

XlatorInterface* Session::createExported(const char* name, qierr_Status* status) {
    if (managerLibrary == nullptr) {
        if (managerStatus.code < 0) {
            qierr_Status_merge(status, &managerStatus);
            return nullptr;
        }
        loadManager(status);
        if (status->code < 0) {
            return nullptr;
        }
    }
    XlatorInterface* xlator = createXlatorFn(managerSession, name, status);
    return keep(name, xlator, &destroyExported, status);
}

XlatorInterface* Session::keep(const char* name, XlatorInterface* xlator, DestroyXlator* destroyer,
                               qierr_Status* status) {
    if (status->code < 0 || xlator == nullptr) {
        return nullptr;
    }
    XlatorEntry entry{{}, xlator, destroyer};
    entry.name.assign(name, status);
    entries.append(std::move(entry), status);
    if (status->code < 0) {
        (*destroyer)(xlator);
        return nullptr;
    }
    return xlator;
}

void Session::loadManager(qierr_Status* status) {
    managerLibrary = qidynlib_load("libqixlator.so.1", status);
    createSessionFn = reinterpret_cast<qixlatormgr_createSession_fn>(
        qidynlib_symbol(managerLibrary, "qixlatormgr_createSession", status));
    destroySessionFn = reinterpret_cast<qixlatormgr_destroySession_fn>(
        qidynlib_symbol(managerLibrary, "qixlatormgr_destroySession", status));
    createXlatorFn = reinterpret_cast<qixlatormgr_createXlator_fn>(
        qidynlib_symbol(managerLibrary, "qixlatormgr_createXlator", status));
    destroyXlatorFn = reinterpret_cast<qixlatormgr_destroyXlator_fn>(
        qidynlib_symbol(managerLibrary, "qixlatormgr_destroyXlator", status));
    if (status->code >= 0) {
        managerSession = createSessionFn(status);
    }
    if (status->code < 0) {
        unloadManager();
        qierr_Status_merge(&managerStatus, status);
    }
}

void Session::unloadManager() {
    if (destroySessionFn != nullptr && managerSession != nullptr) {
        destroySessionFn(managerSession);
    }
    managerSession = nullptr;
    createSessionFn = nullptr;
    destroySessionFn = nullptr;
    createXlatorFn = nullptr;
    destroyXlatorFn = nullptr;
    if (managerLibrary != nullptr) {
        dlclose(managerLibrary);
        managerLibrary = nullptr;
    }
}

}  // namespace qixlator
