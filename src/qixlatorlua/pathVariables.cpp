#include "qixlatorlua/pathVariables.h"

#include <cstring>

#include "qisysq/stdpath.h"
#include "qixlator/reportFailure.h"

namespace qixlatorlua {

namespace {

void getMultiarchLibDir(qihtl::String* value, qierr_Status* status) {
    qisysq::getStandardDir("multiarchlibdir", value, status);
}

struct Variable {
    const char* name;
    void (*get)(qihtl::String* value, qierr_Status* status);
};

constexpr Variable variables[] = {
    {"_qiShared32Dir", qisysq::getSharedDir}, {"_multiarchlibdir", getMultiarchLibDir},
    {"_qiSharedDir", qisysq::getSharedDir},   {"_commonAppDataDir", qisysq::getCommonAppDataDir},
    {"_tempDir", qisysq::getTempDir},
};

// The value of a variable may contain variables, even itself, so the replacements are limited.
constexpr int maximumReplacements = 32;

void reportInvalid(const char* path, qierr_Status* status) {
    qierr_Writer writer = qixlator::reportFailure(status, qiapalerr_invalidParameter,
                                                  QIERR_HERE_NAMED("qiapalerr_invalidParameter"));
    writer = qierr_Writer_addString(writer, "qixlatordll", "plugin dll path invalid");
    qierr_Writer_addString(writer, "dllPath", path);
}

// Replaces the variable that begins at `start`.
void replaceVariable(std::uint32_t start, qihtl::String* path, qierr_Status* status) {
    const char* name = path->c_str() + start + 1;
    const std::size_t nameLength = std::strcspn(name, "/");
    if (name[nameLength] == '\0') {
        reportInvalid(path->c_str(), status);
        return;
    }
    qihtl::String variable;
    qihtl::String value;
    variable.assign(name, static_cast<std::uint32_t>(nameLength), status);
    lookupVariable(variable.c_str(), &value, status);
    path->replace(start, static_cast<std::uint32_t>(nameLength) + 1, value.c_str(), value.length(),
                  status);
}

}  // namespace

void lookupVariable(const char* name, qihtl::String* value, qierr_Status* status) {
    value->clear();
    for (const Variable& variable : variables) {
        if (std::strcmp(variable.name, name) == 0) {
            variable.get(value, status);
            return;
        }
    }
}

void expandPath(const char* path, qihtl::String* expanded, qierr_Status* status) {
    expanded->assign(path, status);
    for (int count = 0; status->code >= 0; ++count) {
        const char* found = std::strchr(expanded->c_str(), '$');
        if (found == nullptr) {
            return;
        }
        if (count == maximumReplacements) {
            reportInvalid(path, status);
            return;
        }
        replaceVariable(static_cast<std::uint32_t>(found - expanded->c_str()), expanded, status);
    }
}

}  // namespace qixlatorlua
