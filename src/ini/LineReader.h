#pragma once

#include <cstddef>
#include <cstdio>
#include <string>

namespace ini {

// Splits a stream into lines. A line ends at a carriage return, a newline or a NUL; two different
// ones of these in a row count as one line end.
class LineReader {
  public:
    explicit LineReader(std::FILE* stream) : stream(stream) {}

    // Skips a UTF-8 byte order mark. Returns false for a UTF-16 or UTF-32 mark. To be called first.
    bool passByteOrderMark();

    // Reads the next line, without its line end. Returns false at the end of the stream.
    bool next(std::string& line);

  private:
    // The next byte, or -1.
    int peek();
    bool fill();

    std::FILE* stream;
    unsigned char buffer[2084];
    std::size_t position = 0;
    std::size_t filled = 0;
};

}  // namespace ini
