#pragma once

#include "qierr/Writer.h"
#include "qixlatorlua/LuaMemory.h"
#include "qixlatorlua/LuaXlator.h"

namespace qixlatorlua {

// Creates a state with all libraries and embedded scripts. Returns null with a negative status on
// failure.
lua_State* openState(LuaRuntime runtime, qierr_Status* status);

// Closes a state and frees its memory. The state may be null.
void closeState(lua_State* L);

// The arena of a state; null for LuaRuntime::Plain.
LuaArena* arenaOf(lua_State* L);

// To be called before anything happens in a state but the calls of its translator's functions: code
// is loaded or run, or garbage is collected.
void expectAnyChange(lua_State* L);

// To be called when a translator has done in a state all that translators do.
void noteCompleteTranslation(lua_State* L);

// Sets qiapalerr_softwareFaultAPALInternalUseOnly for an error of the interpreter. `result` is the
// result of the protected call; the message is on top of the stack. Begins the object
// `qixlatorlua_debug` with the member `debug` and returns a writer for further details. If the
// status already holds an error, the writer does nothing.
qierr_Writer reportLuaFailure(lua_State* L, int result, const char* what, qierr_Status* status);

}  // namespace qixlatorlua
