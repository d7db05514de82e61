#pragma once

#include <cstdint>
#include <cstdio>

#include "qihtl/String.h"

namespace qixlator {

// One pass through an open explanation file in search of one code.
class ExplanationFile {
  public:
    // The file stays the caller's.
    ExplanationFile(std::FILE* file, std::int32_t wantedCode) : file(file), wanted(wantedCode) {}

    // Appends the lines of the first block of the code to `output`, as they stand. Faults of the
    // file are reported in the status.
    void search(qihtl::String* output, qierr_Status* status);

  private:
    // False at the end of the file. Longer lines arrive in pieces.
    bool readLine();
    bool lineBegins(const char* tag) const;
    bool readHeading();
    // Reads one error block; true if it was the wanted one.
    bool readErrorBlock(qihtl::String* output, qierr_Status* status);
    void skipComment();

    std::FILE* file;
    std::int32_t wanted;
    char line[1024] = "";
};

}  // namespace qixlator
