#pragma once

#include "qihtl/Array.h"
#include "qihtl/String.h"
#include "qixlator/qixlator.h"

namespace qixlator {

// How a translator ends depends on where it came from.
class DestroyXlator {
  public:
    virtual ~DestroyXlator() = default;
    virtual void operator()(XlatorInterface* xlator) = 0;
};

// For a translator of this program.
class DestroyLocalXlator : public DestroyXlator {
  public:
    void operator()(XlatorInterface* xlator) override;
};

// For a translator of the manager library.
class DestroyExportedXlator : public DestroyXlator {
  public:
    explicit DestroyExportedXlator(const Session* session) noexcept : session(session) {}
    void operator()(XlatorInterface* xlator) override;

  private:
    const Session* session;
};

struct XlatorEntry {
    qihtl::String name;
    XlatorInterface* xlator;
    DestroyXlator* destroyer;
};

class Session {
  public:
    // Reserves room for the usual number of translators.
    explicit Session(qierr_Status* status) noexcept;
    // Ends the translators in the order of their creation, and then the manager.
    ~Session();
    Session(const Session&) = delete;
    Session& operator=(const Session&) = delete;

    // The translator of this name, made on first use and owned by the session: a registered one,
    // else one of the manager library libqixlator.so.1. Null with a negative status when there is
    // none. A manager that could not be loaded is not tried again.
    XlatorInterface* find(const char* name, qierr_Status* status);

  private:
    friend class DestroyExportedXlator;

    XlatorInterface* findOpen(const char* name) const;
    XlatorInterface* createExported(const char* name, qierr_Status* status);
    // Takes the translator over; on failure it is destroyed and null returned.
    XlatorInterface* keep(const char* name, XlatorInterface* xlator, DestroyXlator* destroyer,
                          qierr_Status* status);
    void loadManager(qierr_Status* status);
    void unloadManager();

    void* managerLibrary = nullptr;
    qierr::Status managerStatus;
    qixlatormgr_createSession_fn createSessionFn = nullptr;
    qixlatormgr_destroySession_fn destroySessionFn = nullptr;
    qixlatormgr_createXlator_fn createXlatorFn = nullptr;
    qixlatormgr_destroyXlator_fn destroyXlatorFn = nullptr;
    qixlatormgr_Session* managerSession = nullptr;
    DestroyLocalXlator destroyLocal;
    DestroyExportedXlator destroyExported;
    qihtl::Array<XlatorEntry> entries;
};

}  // namespace qixlator
