#include "qixlatorlua/libraries.h"

#include <lua.hpp>

#include "qixlatorlua/qixlatorluautils.h"
#include "qixlatorlua/restrictions.h"
#include "stdint/luaopen_stdint.h"

// The header of the JSON module lacks extern "C".
extern "C" {
#include <lfs.h>
#include <lua-cjson.h>
}

namespace qixlatorlua {

namespace {

// Opens the io library. If memory runs out in the middle, the handle of a standard file may not be
// marked yet as one that must not be closed, and the garbage collector would close that file for
// the whole process. Therefore the __gc function of the handles is removed then.
int openFiles(lua_State* L) {
    luaL_newmetatable(L, LUA_FILEHANDLE);
    const int handles = lua_gettop(L);
    lua_pushcfunction(L, luaopen_io);
    lua_pushvalue(L, 1);
    if (lua_pcall(L, 1, 1, 0) != 0) {
        lua_pushnil(L);
        lua_setfield(L, handles, "__gc");
        return lua_error(L);
    }
    return 1;
}

}  // namespace

const LuaLibrary libraries[] = {
    {"", luaopen_base, reportLoading},
    {LUA_LOADLIBNAME, luaopen_package, disableNativeModules},
    {LUA_TABLIBNAME, luaopen_table, nullptr},
    {LUA_IOLIBNAME, openFiles, disablePrograms},
    {LUA_OSLIBNAME, luaopen_os, nullptr},
    {LUA_STRLIBNAME, luaopen_string, nullptr},
    {LUA_MATHLIBNAME, luaopen_math, nullptr},
    {LUA_DBLIBNAME, luaopen_debug, renameDebugPrompt},
    {"lfs", luaopen_lfs, nullptr},
    {"stdint", luaopen_stdint, nullptr},
    {"cjson", luaopen_cjson, nullptr},
    {"qixlatorluautils", luaopen_qixlatorluautils, nullptr},
    {nullptr, nullptr, nullptr},
};

void openLibrary(lua_State* L, const LuaLibrary& library) {
    lua_pushcfunction(L, library.open);
    lua_pushstring(L, library.name);
    lua_call(L, 1, 1);
    if (library.name[0] != '\0') {
        // Some modules do not register themselves in package.loaded.
        lua_getfield(L, LUA_REGISTRYINDEX, "_LOADED");
        lua_pushvalue(L, -2);
        lua_setfield(L, -2, library.name);
        lua_pop(L, 1);
    }
    if (library.restrict != nullptr) {
        library.restrict(L);
    }
    lua_pop(L, 1);
}

}  // namespace qixlatorlua
