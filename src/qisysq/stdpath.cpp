#include "qisysq/stdpath.h"

#include <cstdlib>
#include <cstring>

#include "qisysq/StandardDirectories.h"
#include "qisysq/installRoot.h"
#include "qisysq/stdpath_util.h"

namespace qisysq {

namespace {

constexpr const char* whiteSpace = " \t\n\v\f\r";

void assignRooted(const char* path, qihtl::String* directory, qierr_Status* status) {
    directory->assign(qisysq_installRoot(), status);
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

}  // namespace

void getSharedDir(qihtl::String* directory, qierr_Status* status) {
    qihtl::String path;
    assignRooted("/etc/qinstal/share/share.dir", &path, status);
    if (status->code < 0) {
        return;
    }
    qierr::Status fileStatus;
    qihtl::String text;
    readFileToBuffer(path.c_str(), &text, &fileStatus);
    if (fileStatus.code < 0) {
        assignRooted("/usr/local/qinstal/share", directory, status);
        return;
    }
    trimDirectory(&text, status);
    directory->assign(text.c_str(), text.length(), status);
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
