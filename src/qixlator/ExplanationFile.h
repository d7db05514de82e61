#pragma once

#include <cstdint>
#include <cstdio>

#include "qihtl/String.h"

namespace qixlator {

// Searches an open explanation file once for one code.
class ExplanationFile {
  public:
    // The caller keeps ownership of the file.
    ExplanationFile(std::FILE* file, std::int32_t wantedCode) : file(file), wanted(wantedCode) {}

    // Appends the lines of the first block for the code to `output`, unchanged. Errors in the file
    // are reported in the status.
    void search(qihtl::String* output, qierr_Status* status);

  private:
    // Returns false at the end of the file. A line that exceeds the buffer is read in pieces.
    bool readLine();
    bool lineBegins(const char* tag) const;
    bool readHeading();
    // Reads one error block. Returns true if it is the wanted one.
    bool readErrorBlock(qihtl::String* output, qierr_Status* status);
    void skipComment();

    std::FILE* file;
    std::int32_t wanted;
    char line[1024] = "";
};

}  // namespace qixlator
