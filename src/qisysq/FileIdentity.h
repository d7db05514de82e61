#pragma once

#include <sys/stat.h>

namespace qisysq {

// What shows that a file or directory is the one that was read, and that it has not changed since.
// Its content, its permissions and the entries of a directory do not change without one of these.
struct FileIdentity {
    FileIdentity() noexcept = default;
    explicit FileIdentity(const struct stat& info) noexcept;

    bool operator==(const FileIdentity& other) const noexcept;

    // Whether the last change is long enough ago at `now` that the next change cannot get the same
    // time: file systems record times with a resolution of up to two seconds. What was read of a
    // file that is not settled must not be kept.
    bool isSettled(const timespec& now) const noexcept;

    dev_t device = 0;
    ino_t inode = 0;
    off_t size = 0;
    timespec modified = {};  // the content
    timespec changed = {};   // the content or the attributes
};

// The present time of the clock of the file systems.
timespec fileTime() noexcept;

}  // namespace qisysq
