#include "qisysq/StandardDirectories.h"

#include <dlfcn.h>
#include <qirelocations.h>

#include <cstring>

#include "qisysq/installRoot.h"
#include "qisysq/qidynlib.h"

namespace qisysq {

namespace {

struct Default {
    const char* key;
    const char* directory;
};

constexpr Default defaults[] = {
    {"prefixdir", "/usr"},
    {"execprefixdir", "/usr"},
    {"bindir", "/usr/bin"},
    {"sbindir", "/usr/sbin"},
    {"libdir", "/usr/lib"},
    {"lib32dir", "/usr/lib"},
    {"lib64dir", "/usr/lib64"},
    {"nativelibdir", "/usr/lib"},
    {"multiarchlibdir", "/usr/lib/" QITRMC_MULTIARCH},
    {"libexecdir", "/usr/libexec"},
    {"sharedstatedir", "/var/lib"},
    {"datarootdir", "/usr/share"},
    {"datadir", "/usr/share"},
    {"sysconfdir", "/etc"},
    {"localstatedir", "/var"},
    {"runstatedir", "/var/run"},
    {"includedir", "/usr/include"},
    {"docdir", "/usr/share/doc"},
    {"initddir", "/etc/init.d"},
};

// The buffer size that is passed to the relocation library.
constexpr std::uint32_t relocatedSize = 255;

}  // namespace

StandardDirectories::StandardDirectories(const char* relocationLibrary) {
    addDefaults();
    relocate(relocationLibrary);
}

void StandardDirectories::addDefaults() {
    static_assert(sizeof defaults / sizeof defaults[0] == entryCount);
    for (std::size_t index = 0; index < entryCount; ++index) {
        Entry& entry = entries[index];
        entry.key = defaults[index].key;
        entry.defaultValue.assign(qisysq_installRoot(), &buildStatus);
        entry.defaultValue.append(defaults[index].directory, &buildStatus);
        entry.value.assign(entry.defaultValue.c_str(), &buildStatus);
    }
}

void StandardDirectories::relocate(const char* relocationLibrary) {
    // Without the library or its function, all directories keep their defaults.
    qierr::Status loadStatus;
    void* library = qidynlib_load(relocationLibrary, &loadStatus);
    const auto getRelocatedDir = reinterpret_cast<get_relocated_dir_fn>(
        qidynlib_symbol(library, "get_relocated_dir", &loadStatus));
    for (Entry& entry : entries) {
        if (getRelocatedDir == nullptr) {
            break;
        }
        // One byte more than the size passed, so that a completely filled buffer is terminated.
        char buffer[relocatedSize + 1] = "";
        const std::int32_t count = getRelocatedDir(entry.key, buffer, relocatedSize);
        if (count > 0) {
            entry.value.assign(buffer, &buildStatus);
        } else if (count < 0) {
            qierr_Status_setCodeNamed(&entry.status, qiapalerr_resourceNotFound,
                                      QIERR_HERE_NAMED("qiapalerr_resourceNotFound"));
        }
    }
    if (library != nullptr) {
        dlclose(library);
    }
}

void StandardDirectories::get(const char* key, qihtl::String* directory,
                              qierr_Status* status) const {
    if (status->code < 0) {
        return;
    }
    qierr_Status_merge(status, &buildStatus);
    for (const Entry& entry : entries) {
        if (std::strcmp(entry.key, key) == 0) {
            qierr_Status_merge(status, &entry.status);
            directory->assign(entry.value.c_str(), status);
            return;
        }
    }
    qierr_Status_setCode(status, qiapalerr_osFault);
}

}  // namespace qisysq
