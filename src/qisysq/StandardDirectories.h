#pragma once

#include <cstddef>

#include "qihtl/String.h"

namespace qisysq {

// The standard installation directories: defaults, or the paths given by the optional relocation
// library. Constant after construction, so any number of threads may read it.
class StandardDirectories {
  public:
    // Loads `relocationLibrary` if possible, queries it for every key, and unloads it.
    explicit StandardDirectories(const char* relocationLibrary);
    StandardDirectories(const StandardDirectories&) = delete;
    StandardDirectories& operator=(const StandardDirectories&) = delete;

    // Replaces the text of `directory` by the directory with this key. qiapalerr_osFault without
    // details for an unknown key; qiapalerr_resourceNotFound if its relocation failed. A failure of
    // the constructor is reported by every call.
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
