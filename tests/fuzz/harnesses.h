#pragma once

#include <stdexcept>
#include <string_view>

// What hostile input is sent through: by the fuzzer without end, and by the tests from the files of
// the corpus. A harness returns when all is well. It may keep what is expensive to make, but no
// input may have an effect on the next.
namespace fuzz {

// The product answered an input as it must not.
class Finding : public std::logic_error {
  public:
    using std::logic_error::logic_error;
};

inline void require(bool holds, const char* what) {
    if (!holds)
        throw Finding(what);
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
