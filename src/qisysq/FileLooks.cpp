#include "qisysq/FileLooks.h"

#include <cstring>

namespace qisysq {

namespace {

thread_local FileLooks* innermost = nullptr;

}  // namespace

const LookList::Look* LookList::find(const char* path, std::size_t size) const {
    for (std::size_t index = 0; index < count; ++index) {
        if (looks[index].size == size && std::memcmp(paths + looks[index].path, path, size) == 0) {
            return &looks[index];
        }
    }
    return nullptr;
}

void LookList::add(const char* path, std::size_t size, const FileIdentity& identity, bool isKnown) {
    if (count == maximumCount || size > sizeof paths - used) {
        isComplete = false;
        return;
    }
    std::memcpy(paths + used, path, size);
    looks[count++] = {used, size, identity, isKnown};
    used += size;
}

bool LookList::isRepeated() const {
    for (std::size_t index = 0; index < count; ++index) {
        const Look& look = looks[index];
        FileIdentity now;
        const bool isKnown = lookAtFile(paths + look.path, &now);
        if (isKnown != look.isKnown || !(now == look.identity)) {
            return false;
        }
    }
    return true;
}

FileLooks::FileLooks() noexcept : outer(innermost) {
    innermost = this;
}

FileLooks::~FileLooks() {
    innermost = outer;
}

const LookList* FileLooks::current() {
    return innermost == nullptr ? nullptr : &innermost->list;
}

void FileLooks::setIncomplete() {
    if (innermost != nullptr) {
        innermost->list.isComplete = false;
    }
}

bool lookAtFile(const char* path, FileIdentity* identity) {
    FileLooks* const looks = innermost;
    const std::size_t size = std::strlen(path) + 1;
    const LookList::Look* const earlier = looks == nullptr ? nullptr : looks->list.find(path, size);
    if (earlier != nullptr) {
        *identity = earlier->identity;
        return earlier->isKnown;
    }
    struct stat info;
    const bool isKnown = stat(path, &info) == 0;
    *identity = isKnown ? FileIdentity(info) : FileIdentity();
    if (looks != nullptr) {
        looks->list.add(path, size, *identity, isKnown);
    }
    return isKnown;
}

}  // namespace qisysq
