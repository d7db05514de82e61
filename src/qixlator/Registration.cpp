#include "qixlator/Registration.h"

#include <cstring>

#include "qixlator/defaultXlator.h"

namespace qixlator {

XlatorRegistration::XlatorRegistration() noexcept
    : next(this), prev(this), name(nullptr), registrationInfo(nullptr), create(nullptr) {}

XlatorRegistration::XlatorRegistration(XlatorRegistration& list, const char* name,
                                       const char* registrationInfo, Create create) noexcept
    : next(&list), prev(list.prev), name(name), registrationInfo(registrationInfo), create(create) {
    prev->next = this;
    next->prev = this;
}

XlatorRegistration::~XlatorRegistration() {
    prev->next = next;
    next->prev = prev;
}

const XlatorRegistration* XlatorRegistration::find(const char* wanted) const noexcept {
    for (const XlatorRegistration* entry = next; entry != this; entry = entry->next) {
        if (std::strcmp(entry->name, wanted) == 0) {
            return entry;
        }
    }
    return nullptr;
}

XlatorRegistration& localRegistrations() {
    static XlatorRegistration list;
    return list;
}

namespace {

// Defined here and not beside its translator, so that the linker includes it in every program that
// uses the local list.
const XlatorRegistration defaultRegistration(localRegistrations(), defaultXlatorName, "{}",
                                             qixlator_default_create);

}  // namespace

}  // namespace qixlator
