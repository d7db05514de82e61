#include "qixlator/KeptSearches.h"

#include <algorithm>
#include <cstring>
#include <new>

#include "qisysq/FileLooks.h"

namespace qixlator {

namespace {

using Lock = std::lock_guard<std::mutex>;

bool isNow(const char* path, const qisysq::FileIdentity& identity) {
    qisysq::FileIdentity now;
    return qisysq::lookAtFile(path, &now) && now == identity;
}

void destroy(Search* search) {
    search->~Search();
    qihtl_realloc(search, 0);
}

}  // namespace

// ---- One search ---------------------------------------------------------------------------------

Search::Search(std::int32_t wanted) noexcept : code(wanted), begin(qisysq::fileTime()) {}

bool Search::isFor(const char* wantedDirectory, std::int32_t wantedCode) const {
    return code == wantedCode && directory.equals(wantedDirectory);
}

bool Search::isSettled() const {
    return std::all_of(
        identities.begin(), identities.end(),
        [this](const qisysq::FileIdentity& identity) { return identity.isSettled(begin); });
}

bool Search::isUnchanged() const {
    if (!isNow(directory.c_str(), identities[0])) {
        return false;
    }
    qierr::Status pathStatus;
    qihtl::String path;
    path.reserve(directory.length() + 1 + names.length(), &pathStatus);
    path.assign(directory.c_str(), directory.length(), &pathStatus);
    path.append("/", &pathStatus);
    const char* name = names.c_str();
    for (std::uint32_t index = 1; index < identities.length(); ++index) {
        path.resize(directory.length() + 1, &pathStatus);
        path.append(name, &pathStatus);
        if (pathStatus.code < 0 || !isNow(path.c_str(), identities[index])) {
            return false;
        }
        name += std::strlen(name) + 1;
    }
    return true;
}

std::size_t Search::size() const {
    return sizeof(Search) + directory.capacity() + names.capacity() + text.capacity() +
           identities.capacity() * sizeof(qisysq::FileIdentity);
}

SearchRecording::SearchRecording(const char* directory, std::int32_t code) noexcept {
    void* memory = qihtl_realloc(nullptr, sizeof(Search));
    search = memory == nullptr ? nullptr : new (memory) Search(code);
    if (search != nullptr) {
        search->directory.assign(directory, &status);
        search->identities.reserve(4, &status);
    }
}

SearchRecording::~SearchRecording() {
    if (search != nullptr) {
        destroy(search);
    }
}

void SearchRecording::addDirectory(const struct stat* info) {
    if (search != nullptr && info != nullptr) {
        search->identities.append(qisysq::FileIdentity(*info), &status);
    }
}

void SearchRecording::addEntry(const char* name, const struct stat& info) {
    // The directory and the one above exist as long as the directory does, and do not matter
    // otherwise. Without the directory nothing is kept.
    if (search == nullptr || search->identities.length() == 0 || std::strcmp(name, ".") == 0 ||
        std::strcmp(name, "..") == 0) {
        return;
    }
    search->identities.append(qisysq::FileIdentity(info), &status);
    search->names.append(name, static_cast<std::uint32_t>(std::strlen(name)) + 1, &status);
}

void SearchRecording::keep(const qihtl::String& text) {
    if (search == nullptr || search->identities.length() == 0 || !search->isSettled()) {
        return;
    }
    search->text.assign(text.c_str(), text.length(), &status);
    search->names.shrink();
    if (status.code >= 0) {
        KeptSearches::ofProcess().add(search);
        search = nullptr;
    }
}

// ---- The table ----------------------------------------------------------------------------------

KeptSearches& KeptSearches::ofProcess() {
    static KeptSearches searches;
    return searches;
}

KeptSearches::~KeptSearches() {
    clear();
}

bool KeptSearches::find(const char* directory, std::int32_t code, qihtl::String* output,
                        qierr_Status* status) {
    Search* search = directory == nullptr ? nullptr : acquire(directory, code);
    if (search == nullptr) {
        return false;
    }
    const bool isUnchanged = search->isUnchanged();
    if (isUnchanged) {
        output->assign(search->text.c_str(), search->text.length(), status);
    } else {
        remove(search);
    }
    release(search);
    return isUnchanged;
}

Search* KeptSearches::acquire(const char* directory, std::int32_t code) {
    const Lock lock(mutex);
    for (Search* search = first; search != nullptr; search = search->next) {
        if (search->isFor(directory, code)) {
            ++search->users;
            return search;
        }
    }
    return nullptr;
}

void KeptSearches::release(Search* search) {
    const Lock lock(mutex);
    --search->users;
    if (search->users == 0 && !search->isListed) {
        destroy(search);
    }
}

void KeptSearches::add(Search* search) {
    const Lock lock(mutex);
    while (first != nullptr && bytes + search->size() > maximumSize) {
        removeLocked(first);
    }
    if (bytes + search->size() > maximumSize) {
        destroy(search);
        return;
    }
    (first == nullptr ? first : last->next) = search;
    last = search;
    search->isListed = true;
    bytes += search->size();
}

void KeptSearches::remove(Search* search) {
    const Lock lock(mutex);
    if (search->isListed) {
        removeLocked(search);
    }
}

// Takes a search out of the list and destroys it unless it is in use.
void KeptSearches::removeLocked(Search* search) {
    Search* previous = nullptr;
    for (Search* other = first; other != search; other = other->next) {
        previous = other;
    }
    (previous == nullptr ? first : previous->next) = search->next;
    if (last == search) {
        last = previous;
    }
    search->isListed = false;
    bytes -= search->size();
    if (search->users == 0) {
        destroy(search);
    }
}

void KeptSearches::clear() {
    const Lock lock(mutex);
    while (first != nullptr) {
        removeLocked(first);
    }
}

std::size_t KeptSearches::size() {
    const Lock lock(mutex);
    return bytes;
}

}  // namespace qixlator
