#pragma once

#include <ws_runtime.h>

#include <string>

namespace host {

// Where the plug-in lies when the command line does not say. Throws Failure when it lies nowhere.
std::string findPlugin();

// A service plug-in. It stays loaded to the end of the process: what it leaves behind for the end
// of a thread must find its code.
class Plugin {
  public:
    // Loads the library at `path` and finds its functions. Throws Failure.
    explicit Plugin(const std::string& path);

    // Called once, before the first request. Throws Failure when the plug-in throws.
    void initialize() const;

    // Called once, after the last request. Throws Failure when the plug-in throws.
    void finalize() const;

    // Serves one request. Any number of threads may be in it. Returns false when the plug-in threw,
    // after a line on standard error; the response is then worth nothing.
    bool run(ws_Entry& entry, ws_Request& request) const noexcept;

  private:
    ws_PluginInit qitrmcInit;
    ws_PluginFinalize qitrmcFinalize;
    ws_PluginRun qitrmcRun;
};

}  // namespace host
