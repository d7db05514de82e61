#include "description/TextFile.h"

#include <fcntl.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <cstring>

#include "description/Description.h"

namespace simulator {

namespace {

constexpr std::size_t largestFile = std::size_t{16} << 20;

class OpenFile {
  public:
    explicit OpenFile(const std::string& path) : file(open(path.c_str(), O_RDONLY | O_CLOEXEC)) {}
    OpenFile(const OpenFile&) = delete;
    OpenFile& operator=(const OpenFile&) = delete;
    ~OpenFile() {
        if (file >= 0) {
            close(file);
        }
    }

    bool isOpen() const { return file >= 0; }
    bool askState(struct stat& state) const { return fstat(file, &state) == 0; }
    // The number of bytes, 0 at the end, or below 0.
    ssize_t read(char* buffer, std::size_t size) const {
        ssize_t count = -1;
        do {
            count = ::read(file, buffer, size);
        } while (count < 0 && errno == EINTR);
        return count;
    }

  private:
    const int file;
};

[[noreturn]] void refuseUnreadable(const char* right) {
    throw DescriptionError{"", std::string("cannot be read: ") + std::strerror(errno), right};
}

}  // namespace

FileVersion::FileVersion(const struct stat& state)
    : exists(true),
      isPipe(S_ISFIFO(state.st_mode)),
      device(state.st_dev),
      inode(state.st_ino),
      size(state.st_size),
      seconds(state.st_mtim.tv_sec),
      nanoseconds(state.st_mtim.tv_nsec) {}

bool FileVersion::operator==(const FileVersion& other) const {
    return exists == other.exists && device == other.device && inode == other.inode &&
           size == other.size && seconds == other.seconds && nanoseconds == other.nanoseconds;
}

FileVersion versionOf(const std::string& path) noexcept {
    struct stat state;
    if (stat(path.c_str(), &state) == 0) {
        return FileVersion(state);
    }
    FileVersion unknown;
    unknown.exists = errno != ENOENT && errno != ENOTDIR;
    return unknown;
}

TextFile readTextFile(const std::string& path, const char* right) {
    const OpenFile file(path);
    struct stat state;
    if (!file.isOpen() || !file.askState(state)) {
        refuseUnreadable(right);
    }
    TextFile read{"", FileVersion(state)};
    std::array<char, 4096> piece;
    ssize_t count = 0;
    while ((count = file.read(piece.data(), piece.size())) > 0) {
        read.text.append(piece.data(), static_cast<std::size_t>(count));
        if (read.text.size() > largestFile) {
            throw DescriptionError{"", "is larger than 16 MiB", right};
        }
    }
    if (count < 0) {
        refuseUnreadable(right);
    }
    return read;
}

}  // namespace simulator
