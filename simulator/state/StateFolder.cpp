#include "state/StateFolder.h"

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <charconv>
#include <cstdio>
#include <cstring>
#include <memory>

#include "status/Refusal.h"

namespace simulator {

namespace {

constexpr const char* usableFolder = "QITRMC_SIM_STATE must name a folder that can be written";
constexpr const char* lockName = "lock";
// What is being written. Never read: a process that ends meanwhile leaves a part of a file here.
constexpr const char* unfinishedName = "unfinished";
constexpr std::string_view prefix = "change-";
constexpr std::string_view sessionsName = "sessions";

using FileName = std::array<char, 32>;

FileName fileName(std::uint64_t generation) noexcept {
    FileName name{};
    if (generation == sessionsFile) {
        std::copy(sessionsName.begin(), sessionsName.end(), name.data());
        return name;
    }
    char* const end = std::copy(prefix.begin(), prefix.end(), name.data());
    std::to_chars(end, name.data() + name.size() - 1, generation);
    return name;
}

// Returns 0 for the name of another file.
std::uint64_t generationOf(std::string_view name) {
    std::uint64_t generation = 0;
    if (name.compare(0, prefix.size(), prefix) == 0) {
        std::from_chars(name.data() + prefix.size(), name.data() + name.size(), generation);
    }
    return name == fileName(generation).data() ? generation : 0;
}

int openFolder(const std::string& path) {
    return open(path.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
}

int makeFolder(const std::string& path) {
    const int folder = openFolder(path);
    if (folder >= 0 || errno != ENOENT) {
        return folder;
    }
    for (std::size_t end = path.find('/', 1); end != std::string::npos;
         end = path.find('/', end + 1)) {
        mkdir(path.substr(0, end).c_str(), 0777);
    }
    return mkdir(path.c_str(), 0777) == 0 || errno == EEXIST ? openFolder(path) : -1;
}

bool writeAll(int file, std::string_view content) {
    while (!content.empty()) {
        const ssize_t written = ::write(file, content.data(), content.size());
        if (written < 0 && errno != EINTR) {
            return false;
        }
        content.remove_prefix(written > 0 ? static_cast<std::size_t>(written) : 0);
    }
    return true;
}

bool writeFile(int folder, const char* name, std::string_view content) {
    const Descriptor file(
        openat(folder, name, O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC | O_NOFOLLOW, 0666));
    return file >= 0 && writeAll(file, content) && fsync(file) == 0;
}

[[noreturn]] void refuseWriting(const std::string& path, const std::string& reason) {
    throw Refusal(code::stateNotWritten).usage(tag::fileName, path).usage(tag::explanation, reason);
}

}  // namespace

Descriptor::~Descriptor() {
    if (number >= 0) {
        close(number);
    }
}

StateFolder::StateFolder(const std::string& path)
    : path(path),
      owner(getpid()),
      folder(makeFolder(path)),
      lockFile(folder < 0 ? -1 : openat(folder, lockName, O_RDWR | O_CREAT | O_CLOEXEC, 0666)) {
    if (lockFile < 0) {
        throw StateError{path, std::string("cannot be used: ") + std::strerror(errno),
                         usableFolder};
    }
    lock();
    unlinkat(folder, unfinishedName, 0);
}

void StateFolder::lock() const {
    struct flock wanted = {};
    wanted.l_type = F_WRLCK;
    wanted.l_whence = SEEK_SET;
    if (fcntl(lockFile, F_SETLK, &wanted) == 0) {
        return;
    }
    if (errno != EACCES && errno != EAGAIN) {
        throw StateError{path, std::string("cannot be locked: ") + std::strerror(errno),
                         usableFolder};
    }
    // The owner may have ended since, or run in another process namespace.
    const bool known =
        fcntl(lockFile, F_GETLK, &wanted) == 0 && wanted.l_type != F_UNLCK && wanted.l_pid > 0;
    const std::string holder =
        known ? "process " + std::to_string(wanted.l_pid) : "another process";
    throw StateError{path, "is in use by " + holder,
                     "end that process, or name another folder in QITRMC_SIM_STATE"};
}

std::string StateFolder::filePath(std::uint64_t generation) const {
    return path + "/" + fileName(generation).data();
}

std::vector<std::uint64_t> StateFolder::generations() const {
    // Not std::filesystem, which ends the process when it runs out of memory here.
    const std::unique_ptr<DIR, int (*)(DIR*)> list(opendir(path.c_str()), closedir);
    std::vector<std::uint64_t> found;
    errno = list ? 0 : errno;
    while (const dirent* file = list ? readdir(list.get()) : nullptr) {
        const std::uint64_t generation = generationOf(file->d_name);
        if (generation != 0) {
            found.push_back(generation);
        }
    }
    if (errno != 0) {
        throw StateError{path, std::string("cannot be listed: ") + std::strerror(errno),
                         usableFolder};
    }
    std::sort(found.begin(), found.end());
    return found;
}

bool StateFolder::has(std::uint64_t generation) const {
    struct stat facts = {};
    return fstatat(folder, fileName(generation).data(), &facts, 0) == 0 || errno != ENOENT;
}

std::string StateFolder::read(std::uint64_t generation) const {
    const auto refuse = [&] {
        throw StateError{filePath(generation),
                         std::string("cannot be read: ") + std::strerror(errno),
                         "must be a readable file"};
    };
    const Descriptor file(
        openat(folder, fileName(generation).data(), O_RDONLY | O_NONBLOCK | O_CLOEXEC));
    struct stat facts = {};
    if (file < 0 || fstat(file, &facts) != 0) {
        refuse();
    }
    std::string content(static_cast<std::size_t>(facts.st_size), '\0');
    std::size_t done = 0;
    while (done < content.size()) {
        const ssize_t count = ::read(file, content.data() + done, content.size() - done);
        if (count == 0) {
            break;
        }
        if (count < 0 && errno != EINTR) {
            refuse();
        }
        done += count > 0 ? static_cast<std::size_t>(count) : 0;
    }
    content.resize(done);
    return content;
}

void StateFolder::write(std::uint64_t generation, std::string_view content) const {
    const FileName name = fileName(generation);
    const std::string whole = filePath(generation);
    if (getpid() != owner) {
        refuseWriting(whole, "the folder belongs to process " + std::to_string(owner));
    }
    int reason = 0;
    if (!writeFile(folder, unfinishedName, content) ||
        renameat(folder, unfinishedName, folder, name.data()) != 0) {
        reason = errno;
        unlinkat(folder, unfinishedName, 0);
    } else if (fsync(folder) != 0) {
        reason = errno;
        if (generation != sessionsFile) {
            remove(generation);
        }
    }
    if (reason != 0) {
        refuseWriting(whole, std::strerror(reason));
    }
}

void StateFolder::remove(std::uint64_t generation) const noexcept {
    unlinkat(folder, fileName(generation).data(), 0);
}

}  // namespace simulator
