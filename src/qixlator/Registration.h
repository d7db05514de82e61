#pragma once

#include <qixlatormgr.h>

namespace qixlator {

// An entry of a registration list: how a translator is made. Entries are static objects: one links
// itself in at the end of its list when it is constructed and unlinks itself when it is destroyed.
// The lists change only then, so they are read without a lock.
struct XlatorRegistration {
    using Create = XlatorInterface* (*)(const char* name, const char* registrationInfo,
                                        qierr_Status* status);

    // An empty list.
    XlatorRegistration() noexcept;
    // An entry. The texts are not copied; `registrationInfo` is null where the caller of `create`
    // brings one.
    XlatorRegistration(XlatorRegistration& list, const char* name, const char* registrationInfo,
                       Create create) noexcept;
    ~XlatorRegistration();
    XlatorRegistration(const XlatorRegistration&) = delete;
    XlatorRegistration& operator=(const XlatorRegistration&) = delete;

    // The entry of this name in the list that this is the head of, or null.
    const XlatorRegistration* find(const char* wanted) const noexcept;

    XlatorRegistration* next;
    XlatorRegistration* prev;
    const char* name;
    const char* registrationInfo;
    Create create;
};

// The translators that sessions of this program find.
XlatorRegistration& localRegistrations();

// The translators that this program lends to others.
XlatorRegistration& exportedRegistrations();

}  // namespace qixlator
