#include "qisysq/stdpath.h"

#include <cstdlib>
#include <cstring>
#include <mutex>

#include "qisysq/FileLooks.h"
#include "qisysq/StandardDirectories.h"
#include "qisysq/installRoot.h"
#include "qisysq/stdpath_util.h"

namespace qisysq {

namespace {

constexpr const char* whiteSpace = " \t\n\v\f\r";

void assignRooted(const char* path, qihtl::String* directory, qierr_Status* status) {
    const char* root = qisysq_installRoot();
    directory->reserve(static_cast<std::uint32_t>(std::strlen(root) + std::strlen(path)), status);
    directory->assign(root, status);
    directory->append(path, status);
}

bool endsADirectory(char last) {
    return last == '/' || last == '\0' || std::strchr(whiteSpace, last) != nullptr;
}

void trimDirectory(qihtl::String* text, qierr_Status* status) {
    std::uint32_t length = text->length();
    while (length != 0 && endsADirectory(text->c_str()[length - 1])) {
        --length;
    }
    text->resize(length, status);
    text->trimStart(whiteSpace);
}

// The directory that a file contains, kept as long as the file does not change. Texts that do not
// fit are not kept.
class KeptDirectory {
  public:
    bool get(const char* wantedPath, const FileIdentity& wanted, qihtl::String* text,
             qierr_Status* status) {
        const std::lock_guard<std::mutex> lock(mutex);
        const bool isKept = identity == wanted && std::strcmp(path, wantedPath) == 0;
        if (isKept) {
            text->assign(directory, status);
        }
        return isKept;
    }

    void set(const qihtl::String& newPath, const FileIdentity& newIdentity,
             const qihtl::String& text) {
        const std::lock_guard<std::mutex> lock(mutex);
        if (newPath.length() < sizeof path && text.length() < sizeof directory &&
            std::strlen(text.c_str()) == text.length()) {
            std::strcpy(path, newPath.c_str());
            std::strcpy(directory, text.c_str());
            identity = newIdentity;
        }
    }

  private:
    std::mutex mutex;
    char path[256] = "";
    FileIdentity identity;
    char directory[256] = "";
};

}  // namespace

void getSharedDir(qihtl::String* directory, qierr_Status* status) {
    static KeptDirectory kept;
    qihtl::String path;
    assignRooted("/etc/qinstal/share/share.dir", &path, status);
    if (status->code < 0) {
        return;
    }
    const timespec now = fileTime();
    FileIdentity identity;
    if (!lookAtFile(path.c_str(), &identity)) {
        assignRooted("/usr/local/qinstal/share", directory, status);
        return;
    }
    if (kept.get(path.c_str(), identity, directory, status)) {
        return;
    }
    FileLooks::setIncomplete();
    qierr::Status fileStatus;
    qihtl::String text;
    readFileToBuffer(path.c_str(), &text, &fileStatus);
    if (fileStatus.code < 0) {
        assignRooted("/usr/local/qinstal/share", directory, status);
        return;
    }
    trimDirectory(&text, status);
    directory->assign(text.c_str(), text.length(), status);
    if (status->code >= 0 && identity.isSettled(now)) {
        kept.set(path, identity, *directory);
    }
}

void getCommonAppDataDir(qihtl::String* directory, qierr_Status* status) {
    assignRooted("/var/local/qinstal", directory, status);
}

void getTempDir(qihtl::String* directory, qierr_Status* status) {
    const char* value = std::getenv("TMPDIR");
    directory->assign(value == nullptr ? "/tmp" : value, status);
}

void getStandardDir(const char* key, qihtl::String* directory, qierr_Status* status) {
    if (status->code < 0) {
        return;
    }
    static const StandardDirectories table("libqirelocations.so.0");
    table.get(key, directory, status);
}

}  // namespace qisysq
