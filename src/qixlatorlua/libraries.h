#pragma once

struct lua_State;

// The libraries of a translator's state: those of the interpreter, without the functions that start
// programs or load native code, and the modules of this system.
namespace qixlatorlua {

// One library to open. `name` is "" for the base library.
struct LuaLibrary {
    const char* name;
    int (*open)(lua_State* L);
    // Replaces the functions that scripts must not use; may be null. Expects the library's table on
    // top of the stack and leaves it there.
    void (*restrict)(lua_State* L);
};

// In the order of opening; ends with a null name.
extern const LuaLibrary libraries[];

// Opens one library, so that `require` finds it. Raises a Lua error on failure, so it must run in a
// protected call.
void openLibrary(lua_State* L, const LuaLibrary& library);

}  // namespace qixlatorlua
