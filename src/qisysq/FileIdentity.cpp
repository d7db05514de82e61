#include "qisysq/FileIdentity.h"

#include <ctime>

namespace qisysq {

namespace {

constexpr long settlingSeconds = 2;

bool isEqual(const timespec& left, const timespec& right) {
    return left.tv_sec == right.tv_sec && left.tv_nsec == right.tv_nsec;
}

// Counts whole seconds, so one more than the limit is needed.
bool isOlder(const timespec& time, const timespec& now) {
    return now.tv_sec - time.tv_sec > settlingSeconds;
}

}  // namespace

FileIdentity::FileIdentity(const struct stat& info) noexcept
    : device(info.st_dev),
      inode(info.st_ino),
      size(info.st_size),
      modified(info.st_mtim),
      changed(info.st_ctim) {}

bool FileIdentity::operator==(const FileIdentity& other) const noexcept {
    return device == other.device && inode == other.inode && size == other.size &&
           isEqual(modified, other.modified) && isEqual(changed, other.changed);
}

bool FileIdentity::isSettled(const timespec& now) const noexcept {
    return isOlder(modified, now) && isOlder(changed, now);
}

timespec fileTime() noexcept {
    timespec now = {};
    clock_gettime(CLOCK_REALTIME, &now);
    return now;
}

}  // namespace qisysq
