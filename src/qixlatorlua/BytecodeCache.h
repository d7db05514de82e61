#pragma once

#include "embedded/EmbeddedFiles.h"
#include "qihtl/Array.h"
#include "qihtl/String.h"

struct lua_State;

namespace qixlatorlua {

// The embedded scripts, compiled once. A state then reads a script as bytecode, debug information
// included, when it is first required: results, errors and tracebacks are those of the source.
// Constant once it is made, so that any number of states may use it at the same time.
class BytecodeCache {
  public:
    // Compiles the Lua files of the table. A failed allocation sets the status; a script that
    // cannot be compiled does not: its message is kept.
    BytecodeCache(EmbeddedFiles files, qierr_Status* status);

    // The cache of the embedded files, made on first use. Null when memory ran out; the next call
    // tries again. Any thread.
    static const BytecodeCache* ofEmbeddedFiles();

    // Offers the scripts to a state through package.preload, and writes the line of each script
    // that could not be compiled to standard error. Returns 0, or 1 if there is such a script. The
    // cache must outlive the state. Leaves the stack as it was. Raises a Lua error when memory runs
    // out: call it in a protected call.
    int install(lua_State* L) const;

    // Bytes of bytecode.
    std::uint64_t size() const;

  private:
    struct Script {
        const EmbeddedFile* file;
        qihtl::String bytecode;
        // The compiler's message; empty if there is bytecode.
        qihtl::String failure;
    };

    void compile(lua_State* L, const EmbeddedFile& file, qierr_Status* status);
    const Script* find(const char* module, std::size_t length) const;
    static int load(lua_State* L);

    qihtl::Array<Script> scripts;
};

}  // namespace qixlatorlua
