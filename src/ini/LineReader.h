#pragma once

#include <cstddef>
#include <cstdio>
#include <string>

namespace ini {

// Cuts a stream into lines. A line ends at a carriage return, a newline or a NUL; two different
// ones of these in a row are one end.
class LineReader {
  public:
    explicit LineReader(std::FILE* stream) : stream(stream) {}

    // Passes the byte order mark of UTF-8. False at a mark of UTF-16 or UTF-32. Call it first.
    bool passByteOrderMark();

    // The next line without its end. False at the end of the stream.
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
