#pragma once

#include <qixlatormgr.h>

namespace qixlator {

// An entry of a registration list: a translator's name and the function that creates it. Entries
// are static objects. The constructor appends the entry to its list and the destructor removes it.
// The lists do not change otherwise, so they are read without a lock.
struct XlatorRegistration {
    using Create = XlatorInterface* (*)(const char* name, const char* registrationInfo,
                                        qierr_Status* status);

    // Constructs an empty list.
    XlatorRegistration() noexcept;
    // Constructs an entry. The texts are not copied; `registrationInfo` is null if the caller of
    // `create` passes one.
    XlatorRegistration(XlatorRegistration& list, const char* name, const char* registrationInfo,
                       Create create) noexcept;
    ~XlatorRegistration();
    XlatorRegistration(const XlatorRegistration&) = delete;
    XlatorRegistration& operator=(const XlatorRegistration&) = delete;

    // The entry with this name in the list whose head this is, or null.
    const XlatorRegistration* find(const char* wanted) const noexcept;

    XlatorRegistration* next;
    XlatorRegistration* prev;
    const char* name;
    const char* registrationInfo;
    Create create;
};

// The translators for sessions of this program.
XlatorRegistration& localRegistrations();

// The translators that this program offers to other programs.
XlatorRegistration& exportedRegistrations();

}  // namespace qixlator
