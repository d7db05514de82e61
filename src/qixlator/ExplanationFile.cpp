#include "qixlator/ExplanationFile.h"

#include <strings.h>

#include <cstring>

#include "qixlator/reportFailure.h"

namespace qixlator {

namespace {

constexpr const char* errorTag = "<qierror code=\"";

qierr_Writer reportFault(const char* what, qierr_Status* status) {
    qierr_Writer writer = reportFailure(status, qiapalerr_resourceNotFound,
                                        QIERR_HERE_NAMED("qiapalerr_resourceNotFound"));
    return qierr_Writer_addString(writer, "debug", what);
}

}  // namespace

bool ExplanationFile::readLine() {
    return std::fgets(line, sizeof line, file) != nullptr;
}

bool ExplanationFile::lineBegins(const char* tag) const {
    return strncasecmp(line, tag, std::strlen(tag)) == 0;
}

bool ExplanationFile::readHeading() {
    return readLine() && lineBegins("<?xml version=\"1.0\"") && readLine() &&
           lineBegins("<qidocument>") && readLine();
}

bool ExplanationFile::readErrorBlock(qihtl::String* output, qierr_Status* status) {
    // Wider than a code, so that a number beyond the codes matches none instead of some on targets
    // that wrap it.
    long long code = 0;
    const int converted = std::sscanf(line + std::strlen(errorTag), "%lli", &code);
    if (converted != 1) {
        qierr_Writer writer = reportFault("Could not successfully read the status data!", status);
        qierr_Writer_addInt(writer, "sscanf", converted);
        return false;
    }
    while (readLine()) {
        if (lineBegins("</qierror>")) {
            return code == wanted;
        }
        if (code == wanted) {
            output->append(line, status);
        }
    }
    reportFault("Bad explanation file. Could not find the end of the status code definition !",
                status);
    return false;
}

void ExplanationFile::skipComment() {
    while (readLine() && !lineBegins("</qicomment>")) {
    }
}

void ExplanationFile::search(qihtl::String* output, qierr_Status* status) {
    if (!readHeading()) {
        return;
    }
    do {
        if (lineBegins("</qidocument>")) {
            return;
        }
        if (lineBegins(errorTag)) {
            if (readErrorBlock(output, status) || status->code < 0) {
                return;
            }
        } else if (lineBegins("<qicomment>")) {
            skipComment();
        } else if (line[0] == '\0') {
            reportFault("Bad explanation file. Unidentified section heading !", status);
            return;
        }
    } while (readLine());
}

}  // namespace qixlator
