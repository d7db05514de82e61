#pragma once

#include <stdexcept>
#include <string_view>

// The functions that receive hostile input, from the fuzzer and, in the tests, from the files of
// the corpus. A harness returns when the input is handled correctly. It may keep what is expensive
// to make, but no input may affect the next.
namespace fuzz {

// Thrown when the code under test handles an input wrongly.
class Finding : public std::logic_error {
  public:
    using std::logic_error::logic_error;
};

inline void require(bool holds, const char* what) {
    if (!holds) {
        throw Finding(what);
    }
}

// The body of a request, answered by the whole service on a driver that keeps sessions.
void handleRequest(std::string_view input);

// The name of a schema file without "procedure_" and ".json", a newline, and a request.
void validateSchema(std::string_view input);

// A digit for the kind of names, and a list of names.
void parseNames(std::string_view input);

// The JSON text of a status up to its first NUL, and behind that a text to add to it.
void editStatus(std::string_view input);

// A character whose bits are the settings of the reader, and the text of an ini file.
void readIni(std::string_view input);

// The text of a chassis file of the simulated driver.
void parseChassis(std::string_view input);

}  // namespace fuzz
