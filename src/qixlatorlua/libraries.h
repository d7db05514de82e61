#pragma once

struct lua_State;

// The libraries of a translator's state: those of the interpreter, without the means to start
// programs or to load native code, and the modules of this system.
namespace qixlatorlua {

// One library to open. `name` is "" for the base library.
struct LuaLibrary {
    const char* name;
    int (*open)(lua_State* L);
    // Replaces what the scripts must not have; may be null. The library's table is on the top of
    // the stack and stays there.
    void (*restrict)(lua_State* L);
};

// In the order of opening; ends with a null name.
extern const LuaLibrary libraries[];

// Opens one library, so that `require` finds it. Raises a Lua error when that fails: to be called
// in a protected call.
void openLibrary(lua_State* L, const LuaLibrary& library);

}  // namespace qixlatorlua
