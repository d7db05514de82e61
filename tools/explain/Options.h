#pragma once

#include <string>

namespace CLI {
class App;
}

namespace explain {

struct Options {
    std::string status;    // a code, a name, a JSON text or "-"; empty: none given
    std::string details;   // a JSON text or "-"; empty: none given
    std::string language;  // empty: that of the environment
    std::string word;      // what --search looks for
    bool list = false;
    bool search = false;
    bool formatted = false;
    bool debug = false;
};

// Adds the options to `app`, which stores their values in `options`; `options` must outlive `app`.
void addOptions(CLI::App& app, Options& options);

// Throws UsageError for options that cannot be combined.
void checkOptions(const Options& options);

}  // namespace explain
