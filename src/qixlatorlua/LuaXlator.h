// Folder qixlatorlua: runs translators that are written in Lua.
#pragma once

#include <qixlatormgr.h>

struct lua_State;

// A translator that is written in Lua. Each has one Lua state and belongs to one session.
namespace qixlatorlua {

struct LuaXlator : XlatorInterface {
    // Null until the state is completely set up.
    lua_State* L;
    // Whether it has described a code and a status.
    bool describedCode;
    bool describedStatus;
};

// How a Lua state loads its scripts and allocates its memory. Results, failures and the output on
// standard error are the same for all.
enum class LuaRuntime {
    // Compiles every script and allocates each block separately.
    Plain,
    // Loads a script as bytecode when it is required, and allocates from an arena. The bytecode is
    // compiled once in the process; if there is no memory for it, every script is compiled.
    Fast,
    // As Fast, but a state is only set up for the first translator; each further one gets a copy of
    // it as it was before its first use (see PreparedStates). For translators that are destroyed
    // after one translation, since the number of these states is limited.
    Prepared,
};

// Creates a translator: opens a state with the libraries and embedded scripts and configures it
// with the registration text, a JSON object with
//
//   qixlatorlua_xlator    the module that implements the translator
//   qixlatorlua_settings  optional: an object for the scripts
//   qixlatorlua_path      optional: directories to search for scripts, separated by semicolons
//
// Returns null if the status is already negative, with qiapalerr_memoryFull if memory for the state
// runs out, and with qiapalerr_softwareFaultAPALInternalUseOnly if Lua reports an error. The
// translator is freed by its function `destroy`.
XlatorInterface* createLuaXlator(const char* name, const char* registrationInfo, LuaRuntime runtime,
                                 qierr_Status* status);

}  // namespace qixlatorlua
