#include "host/Plugin.h"

#include <dlfcn.h>

#include <cstdio>
#include <exception>
#include <filesystem>

#include "host/Failure.h"

namespace host {

namespace {

namespace fs = std::filesystem;

constexpr const char* fileName = "libqitrmcsvc.so";

void* load(const std::string& path) {
    std::error_code error;
    if (!fs::exists(path, error)) {
        throw Failure("There is no plug-in file " + path +
                      ". Build it, or name another with --plugin.");
    }
    // An absolute path: a name without a slash would be looked for among the system's libraries.
    void* library = dlopen(fs::absolute(path).c_str(), RTLD_NOW | RTLD_LOCAL);
    if (library == nullptr) {
        throw Failure(std::string("The plug-in cannot be loaded: ") + dlerror() +
                      ". Name a plug-in that is built for this machine with --plugin.");
    }
    return library;
}

template <typename Function>
Function find(void* library, const std::string& path, const char* name) {
    void* function = dlsym(library, name);
    if (function == nullptr) {
        throw Failure("The library " + path + " has no function " + name +
                      ". Name a plug-in of this service with --plugin.");
    }
    return reinterpret_cast<Function>(function);
}

// What the exception in flight says; valid as long as it is in flight.
const char* describeException() noexcept {
    try {
        throw;
    } catch (const std::exception& error) {
        return error.what();
    } catch (...) {
        return "an exception of an unknown kind";
    }
}

void callGuarded(void (*function)(), const char* name) {
    try {
        function();
    } catch (...) {
        throw Failure(std::string("The plug-in's ") + name + " failed: " + describeException() +
                      ". Look into the plug-in and its configuration.");
    }
}

}  // namespace

std::string findPlugin() {
    const fs::path folder = fs::read_symlink("/proc/self/exe").parent_path();
    const fs::path candidates[] = {folder.parent_path() / "lib" / fileName, folder / fileName};
    for (const fs::path& candidate : candidates) {
        if (fs::exists(candidate)) {
            return candidate;
        }
    }
    throw Failure("There is no plug-in at " + candidates[0].string() + " nor at " +
                  candidates[1].string() + ". Build it, or name another with --plugin.");
}

Plugin::Plugin(const std::string& path) {
    void* library = load(path);
    qitrmcInit = find<ws_PluginInit>(library, path, "qitrmcInit");
    qitrmcFinalize = find<ws_PluginFinalize>(library, path, "qitrmcFinalize");
    qitrmcRun = find<ws_PluginRun>(library, path, "qitrmcRun");
    // This host never pauses, but a library without the two is no plug-in.
    find<ws_PluginPause>(library, path, "qitrmcPause");
    find<ws_PluginResume>(library, path, "qitrmcResume");
}

void Plugin::initialize() const {
    callGuarded(qitrmcInit, "qitrmcInit");
}

void Plugin::finalize() const {
    callGuarded(qitrmcFinalize, "qitrmcFinalize");
}

bool Plugin::run(ws_Entry& entry, ws_Request& request) const noexcept {
    try {
        qitrmcRun(&entry, &request);
        return true;
    } catch (...) {
        std::fprintf(stderr, "The plug-in's qitrmcRun failed: %s\n", describeException());
        return false;
    }
}

}  // namespace host
