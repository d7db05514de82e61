#pragma once

#include <mutex>

#include "embedded/EmbeddedFiles.h"
#include "qihtl/Array.h"
#include "qihtl/String.h"

struct lua_State;

namespace qixlatorlua {

// The embedded scripts as bytecode. A state loads a script from it when the script is first
// required; the first state that does so compiles the script. The bytecode includes the debug
// information, so results, errors and tracebacks are the same as those of the source. Any number of
// states may use it at the same time.
class BytecodeCache {
  public:
    // Checks the Lua files of the table. A failed allocation sets the status. A script that cannot
    // be compiled does not; its error message is kept.
    BytecodeCache(EmbeddedFiles files, qierr_Status* status);

    // The cache of the embedded files, created on first use. Null if memory runs out; the next call
    // then tries again. Any thread may call it.
    static const BytecodeCache* ofEmbeddedFiles();

    // Makes the scripts available to a state through package.preload, and writes a line to standard
    // error for each script that could not be compiled. Returns 0, or 1 if there is such a script.
    // The cache must outlive the state. Leaves the stack unchanged. Raises a Lua error if memory
    // runs out, so it must run in a protected call.
    int install(lua_State* L) const;

    // The size of the bytecode so far, in bytes.
    std::uint64_t size() const;

  private:
    struct Script {
        const EmbeddedFile* file;
        // That of the module, without the extension of the file.
        std::size_t nameLength;
        // Empty until a state has required the script.
        qihtl::String bytecode;
        // The compiler's error message; empty if there is bytecode.
        qihtl::String failure;
    };

    void check(lua_State* L, const EmbeddedFile& file, qierr_Status* status);
    Script* find(const char* module, std::size_t length) const;
    // Pushes the compiled script, or the message of a failure.
    int push(lua_State* L, Script* script) const;
    void keepBytecode(lua_State* L, Script* script) const;
    static int load(lua_State* L);

    // The bytecode of a script changes once, under the lock.
    mutable std::mutex mutex;
    mutable qihtl::Array<Script> scripts;
};

}  // namespace qixlatorlua
