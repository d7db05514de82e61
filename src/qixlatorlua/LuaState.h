#pragma once

#include "qierr/Writer.h"
#include "qixlatorlua/LuaXlator.h"

namespace qixlatorlua {

// Makes a state with all libraries and embedded scripts. Null with a negative status on failure.
lua_State* openState(LuaRuntime runtime, qierr_Status* status);

// Closes a state and frees its memory. The state may be null.
void closeState(lua_State* L);

// Sets qiapalerr_softwareFaultAPALInternalUseOnly for what the interpreter reports: `result` is
// what the protected call returned, the message stands on the top of the stack. Opens the object
// `qixlatorlua_debug` with the member `debug` for further notes; the writer does nothing when an
// earlier error stands.
qierr_Writer reportLuaFailure(lua_State* L, int result, const char* what, qierr_Status* status);

}  // namespace qixlatorlua
