#pragma once

struct lua_State;

// What a translator's script cannot do, whatever the installed interpreter was built for. Each
// function finds the table of its library on the top of the stack and leaves it there.
namespace qixlatorlua {

// package.loadlib and the loaders of native modules answer as in an interpreter without dynamic
// loading.
void disableNativeModules(lua_State* L);

// io.popen raises "'popen' not supported".
void disablePrograms(lua_State* L);

// debug.debug prompts with "hlua_debug> ".
void renameDebugPrompt(lua_State* L);

}  // namespace qixlatorlua
