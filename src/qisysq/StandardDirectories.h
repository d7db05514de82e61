#pragma once

#include <cstddef>

#include "qihtl/String.h"

namespace qisysq {

// The standard installation directories, each at its default or where the optional relocation
// library puts it. Filled by the constructor and constant from then on, so that any number of
// threads may read it.
class StandardDirectories {
  public:
    // Asks `relocationLibrary`, if it can be loaded, for every key and unloads it again.
    explicit StandardDirectories(const char* relocationLibrary);
    StandardDirectories(const StandardDirectories&) = delete;
    StandardDirectories& operator=(const StandardDirectories&) = delete;

    // Replaces the text of `directory` by the directory of this key. qiapalerr_osFault without
    // details for an unknown key, qiapalerr_resourceNotFound if its relocation failed, and the
    // failure of the constructor, if there was one, on each call.
    void get(const char* key, qihtl::String* directory, qierr_Status* status) const;

  private:
    struct Entry {
        const char* key;
        qihtl::String defaultValue;
        qihtl::String value;
        qierr::Status status;
    };
    static constexpr std::size_t entryCount = 19;

    void addDefaults();
    void relocate(const char* relocationLibrary);

    Entry entries[entryCount];
    qierr::Status buildStatus;
};

}  // namespace qisysq
