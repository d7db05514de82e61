#pragma once

struct lua_State;

// Restrictions for translator scripts, independent of how the installed interpreter was built. Each
// function expects the table of its library on top of the stack and leaves it there.
namespace qixlatorlua {

// Makes the functions that load code call expectAnyChange first; the loader of scripts in
// directories gets the same from disableNativeModules. With that of embedded scripts
// (BytecodeCache) these are all ways in which other code than that of the translator gets into a
// state.
void reportLoading(lua_State* L);

// Makes package.loadlib and the loaders of native modules behave as in an interpreter without
// dynamic loading.
void disableNativeModules(lua_State* L);

// Makes io.popen raise "'popen' not supported".
void disablePrograms(lua_State* L);

// Changes the prompt of debug.debug to "hlua_debug> ".
void renameDebugPrompt(lua_State* L);

}  // namespace qixlatorlua
