#pragma once

#include "qihtl/Array.h"
#include "qihtl/String.h"
#include "qixlator/qixlator.h"

namespace qixlator {

// Destroys a translator. The way to do so depends on where the translator was created.
class DestroyXlator {
  public:
    virtual ~DestroyXlator() = default;
    virtual void operator()(XlatorInterface* xlator) = 0;
};

// For a translator that this program created.
class DestroyLocalXlator : public DestroyXlator {
  public:
    void operator()(XlatorInterface* xlator) override;
};

// For a translator that the manager library created.
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
    // Reserves memory for the usual number of translators.
    explicit Session(qierr_Status* status) noexcept;
    // Destroys the translators in the order of their creation, then unloads the manager.
    ~Session();
    Session(const Session&) = delete;
    Session& operator=(const Session&) = delete;

    // The translator with this name, created on first use and owned by the session: a registered
    // one, or else one of the manager library libqixlator.so.1. Null with a negative status if
    // there is none. If loading the manager fails, the session does not try again.
    XlatorInterface* find(const char* name, qierr_Status* status);

  private:
    friend class DestroyExportedXlator;

    XlatorInterface* findOpen(const char* name) const;
    XlatorInterface* createExported(const char* name, qierr_Status* status);
    // Takes ownership of the translator; on failure destroys it and returns null.
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
