// A stand-in for the optional translator manager. It keeps a log of its calls.
//
// MANAGER_FAILS: the session cannot be made. MANAGER_LACKS_FUNCTION: the last function is missing.

#include <qixlatormgr.h>

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>

#define EXPORTED extern "C" __attribute__((visibility("default")))

struct qixlatormgr_Session {
    int unused;
};

namespace {

char calls[1024];
qixlatormgr_Session theSession;

void note(const char* call) {
    std::strcat(calls, call);
    std::strcat(calls, ";");
}

char* describeCode(XlatorInterface*, std::int32_t code, std::uint32_t, qixlator_Alloc alloc,
                   void* allocContext, qierr_Status* status) {
    char* text = static_cast<char*>(alloc(nullptr, 64, allocContext, status));
    if (text != nullptr) {
        std::snprintf(text, 64, "managed %d", code);
    }
    return text;
}

void destroyWrongly(XlatorInterface*) {
    note("destroyed directly");
}

XlatorInterface theXlator = {16, destroyWrongly, describeCode, nullptr};

}  // namespace

EXPORTED const char* manager_calls() {
    return calls;
}

EXPORTED qixlatormgr_Session* qixlatormgr_createSession(qierr_Status* status) {
    note("createSession");
#ifdef MANAGER_FAILS
    status->code = -5;
#else
    static_cast<void>(status);
#endif
    return &theSession;
}

EXPORTED void qixlatormgr_destroySession(qixlatormgr_Session* session) {
    note(session == &theSession ? "destroySession" : "destroySession of a stranger");
}

EXPORTED XlatorInterface* qixlatormgr_createXlator(qixlatormgr_Session* session, const char* name,
                                                   qierr_Status* status) {
    note(session == &theSession ? "createXlator" : "createXlator for a stranger");
    if (std::strcmp(name, "known") != 0) {
        status->code = -6;
        return nullptr;
    }
    return &theXlator;
}

#ifndef MANAGER_LACKS_FUNCTION
EXPORTED void qixlatormgr_destroyXlator(qixlatormgr_Session* session, XlatorInterface* xlator) {
    note(session == &theSession && xlator == &theXlator ? "destroyXlator"
                                                        : "destroyXlator of a stranger");
}
#endif
