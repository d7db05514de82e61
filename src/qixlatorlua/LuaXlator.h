#pragma once

#include <qixlatormgr.h>

struct lua_State;

// The host of a translator that is written in Lua. One host is one Lua state, made for one session.
namespace qixlatorlua {

struct LuaXlator : XlatorInterface {
    // Null until the state is complete.
    lua_State* L;
};

// How the state of a translator gets its scripts and its memory. Results, failures and what is
// written to standard error are the same.
enum class LuaRuntime {
    // Compiles every script, and allocates each block by itself.
    plain,
    // Reads bytecode, compiled once in the process, when it is required, and allocates from an
    // arena. Compiles every script when there is no memory for the bytecode.
    fast,
};

// Makes a translator: opens a state with the libraries and embedded scripts and sets it up by the
// registration text, a JSON object with
//
//   qixlatorlua_xlator    the module that is the translator
//   qixlatorlua_settings  optional: an object for the scripts
//   qixlatorlua_path      optional: directories to search for scripts, separated by semicolons
//
// Null with qiapalerr_memoryFull when memory runs out for the state, with
// qiapalerr_softwareFaultAPALInternalUseOnly when Lua reports an error, and when the status is
// already negative. The translator is ended by its own destroy.
XlatorInterface* createLuaXlator(const char* name, const char* registrationInfo, LuaRuntime runtime,
                                 qierr_Status* status);

}  // namespace qixlatorlua
