#include "qixlator/qvErrorsParser.h"

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <iterator>
#include <new>

#include "qisysq/FileLooks.h"
#include "qisysq/stdpath_util.h"
#include "qixlator/DirectoryWalker.h"
#include "qixlator/ExplanationFile.h"
#include "qixlator/KeptSearches.h"
#include "qixlator/reportFailure.h"

namespace qixlator {

namespace {

constexpr const char* languageDirectories[] = {"English",  "French", "German",
                                               "Japanese", "Korean", "ChineseS"};

void reportNotOpened(const char* path, qierr_Status* status) {
    qierr_Writer writer = reportFailure(status, qiapalerr_resourceNotFound,
                                        QIERR_HERE_NAMED("qiapalerr_resourceNotFound"));
    writer = qierr_Writer_addString(writer, "debug", "Could not open status explanations file");
    qierr_Writer_addString(writer, "path", path);
}

void reportDirectory(const char* key, const char* what, const char* directory, int error,
                     qierr_Status* status) {
    qierr_Status_setCodeNamed(status, qiapalerr_resourceNotFound,
                              QIERR_HERE_NAMED("qiapalerr_resourceNotFound"));
    qierr_Writer writer = qisysq_addErrno(qierr_Status_writerAtEnd(status), error);
    writer = qierr_Writer_beginObject(writer, "qixlator_debug");
    writer = qierr_Writer_addString(writer, key, what);
    qierr_Writer_addString(writer, "path", directory == nullptr ? "" : directory);
}

void reportNoMemory(qierr_Status* status) {
    qierr_Writer writer =
        reportFailure(status, qiapalerr_memoryFull, QIERR_HERE_NAMED("qiapalerr_memoryFull"));
    qierr_Writer_addString(writer, "qixlator", "failed to allocate memory");
}

// Owns a record on the heap, since both record types are too large for a small thread stack. Null
// if memory runs out.
template <typename Record>
class OnHeap {
  public:
    OnHeap() : record(nullptr) {
        void* memory = qihtl_realloc(nullptr, sizeof(Record));
        if (memory != nullptr) {
            record = new (memory) Record();
        }
    }
    ~OnHeap() {
        if (record != nullptr) {
            record->~Record();
            qihtl_realloc(record, 0);
        }
    }
    OnHeap(const OnHeap&) = delete;
    OnHeap& operator=(const OnHeap&) = delete;

    Record* get() const { return record; }

  private:
    Record* record;
};

bool isExplanationFile(const FileEntry& entry) {
    return entry.isRegularFile &&
           (std::strcmp(entry.extension, "txt") == 0 || std::strcmp(entry.extension, "err") == 0);
}

void searchEntries(DirectoryWalker* walker, FileEntry* entry, const char* directory,
                   std::int32_t code, SearchRecording* recording, qihtl::String* output,
                   qierr_Status* status) {
    for (; walker->hasEntry(); walker->advance()) {
        const int error = walker->describe(entry);
        if (error != 0) {
            reportDirectory("qixlator", "get file info failed", directory, error, status);
            return;
        }
        recording->addEntry(entry->name, entry->info);
        if (isExplanationFile(*entry)) {
            findErrorDescriptionFromFile(entry->path, code, output, status);
        }
        if (status->code < 0 || !output->empty()) {
            return;
        }
    }
}

bool holdsMoreThanLineEnds(const qihtl::String& text) {
    return std::strspn(text.c_str(), "\r\n") < text.length();
}

}  // namespace

void findErrorDescriptionFromFile(const char* path, std::int32_t code, qihtl::String* output,
                                  qierr_Status* status) {
    output->clear();
    if (status->code < 0) {
        return;
    }
    std::FILE* file = std::fopen(path, "r");
    if (file == nullptr) {
        reportNotOpened(path, status);
        return;
    }
    ExplanationFile(file, code).search(output, status);
    if (holdsMoreThanLineEnds(*output)) {
        output->trimEnd("\r\n");
    }
    if (status->code < 0) {
        output->clear();
    }
    std::fclose(file);
}

void findErrorDescriptionFromDir(const char* directory, std::int32_t code, qihtl::String* output,
                                 qierr_Status* status) {
    output->clear();
    if (status->code < 0 || KeptSearches::ofProcess().find(directory, code, output, status)) {
        return;
    }
    qisysq::FileLooks::setIncomplete();
    OnHeap<DirectoryWalker> walker;
    OnHeap<FileEntry> entry;
    if (walker.get() == nullptr || entry.get() == nullptr) {
        reportNoMemory(status);
        return;
    }
    // Begins before anything is looked at.
    SearchRecording recording(directory, code);
    if (!walker.get()->open(directory)) {
        reportDirectory("debug", "open dir failed", directory, errno, status);
        return;
    }
    recording.addDirectory(walker.get()->info());
    searchEntries(walker.get(), entry.get(), directory, code, &recording, output, status);
    if (status->code >= 0) {
        recording.keep(*output);
    }
}

void findErrorDescriptionFromErrorsDir(const char* errorsDirectory, std::int32_t code,
                                       std::int32_t language, qihtl::String* output,
                                       qierr_Status* status) {
    output->clear();
    qihtl::String path;
    path.assign(errorsDirectory, status);
    path.append("/", status);
    path.append(convertLangToDir(language, status), status);
    findErrorDescriptionFromDir(path.c_str(), code, output, status);
    if (status->code >= 0 && output->empty()) {
        findErrorDescriptionFromDir(errorsDirectory, code, output, status);
    }
}

const char* convertLangToDir(std::int32_t language, qierr_Status* status) {
    if (language >= 0 && language < static_cast<std::int32_t>(std::size(languageDirectories))) {
        return languageDirectories[language];
    }
    qierr_Writer writer = reportFailure(status, qiapalerr_invalidParameter,
                                        QIERR_HERE_NAMED("qiapalerr_invalidParameter"));
    writer = qierr_Writer_addString(writer, "qverrorsparser", "invalid language");
    qierr_Writer_addInt(writer, "lang", language);
    return "";
}

}  // namespace qixlator
