#pragma once

#include <ws_runtime.h>

#include <map>
#include <string>
#include <vector>

// One HTTP request as the web runtime presents it, for tests of the plug-in's entry points. Records
// what the plug-in does, in order: "code 404", "type text/plain", "write abc".
struct ws_Request {
    // A text that does not fit the buffer makes the first call fail and return the size.
    std::map<std::string, std::string> variables = {{"REQUEST_TRANSPORT", "http"},
                                                    {"REQUEST_METHOD", "POST"}};
    std::string body;
    bool bodyReadable = true;
    // Fails the second call of a body read as well.
    bool bodyFailsForGood = false;

    std::vector<std::string> done;
    std::vector<std::uint32_t> variableBufferSizes;
    std::vector<std::uint32_t> bodyBufferSizes;
};

// An entry of the given name.
class FakeEntry : public ws_Entry {
  public:
    explicit FakeEntry(const std::u32string& entryName);

    std::u32string name;
};
