#include "qixlatorlua/restrictions.h"

#include <cstdio>
#include <cstring>
#include <lua.hpp>

#include "qixlatorlua/LuaState.h"

// These functions must not own resources: a Lua error is a longjmp that skips destructors.

namespace qixlatorlua {

namespace {

constexpr const char* noLoading = "dynamic libraries not enabled; check your Lua installation";

int loadLibrary(lua_State* L) {
    luaL_checkstring(L, 1);
    luaL_checkstring(L, 2);
    lua_pushnil(L);
    lua_pushstring(L, noLoading);
    lua_pushliteral(L, "absent");
    return 3;
}

bool isReadable(const char* path) {
    std::FILE* file = std::fopen(path, "r");
    if (file != nullptr) {
        std::fclose(file);
    }
    return file != nullptr;
}

// Searches package.cpath for a native module. Pushes the path of the module, or else the list of
// all paths that were tried, and returns whether it was found. `module` is the stack index of its
// name.
bool pushNativeModule(lua_State* L, int module) {
    luaL_gsub(L, lua_tostring(L, module), ".", LUA_DIRSEP);
    const int fileName = lua_gettop(L);
    lua_getfield(L, LUA_ENVIRONINDEX, "cpath");
    const int path = lua_gettop(L);
    if (lua_tostring(L, path) == nullptr) {
        luaL_error(L, LUA_QL("package.cpath") " must be a string");
    }
    lua_pushliteral(L, "");
    const char* next = lua_tostring(L, path);
    while (*next != '\0') {
        const std::size_t length = std::strcspn(next, LUA_PATHSEP);
        if (length != 0) {
            lua_pushlstring(L, next, length);
            luaL_gsub(L, lua_tostring(L, -1), LUA_PATH_MARK, lua_tostring(L, fileName));
            lua_remove(L, -2);
            if (isReadable(lua_tostring(L, -1))) {
                return true;
            }
            lua_pushfstring(L, "\n\tno file " LUA_QS, lua_tostring(L, -1));
            lua_remove(L, -2);
            lua_concat(L, 2);
        }
        next += next[length] == '\0' ? length : length + 1;
    }
    return false;
}

// Handles a native module, whose name is at the stack index `module`. Returns the list of paths
// that were tried if there is no such module; raises an error if there is one, since it is never
// loaded.
int findNativeModule(lua_State* L, int module) {
    if (pushNativeModule(L, module)) {
        return luaL_error(L, "error loading module " LUA_QS " from file " LUA_QS ":\n\t%s",
                          lua_tostring(L, 1), lua_tostring(L, -1), noLoading);
    }
    return 1;
}

int loadNativeModule(lua_State* L) {
    luaL_checkstring(L, 1);
    return findNativeModule(L, 1);
}

// The loader for a module a.b in the library of the module a.
int loadFromRootModule(lua_State* L) {
    const char* name = luaL_checkstring(L, 1);
    const char* dot = std::strchr(name, '.');
    if (dot == nullptr) {
        return 0;
    }
    lua_pushlstring(L, name, static_cast<std::size_t>(dot - name));
    return findNativeModule(L, lua_gettop(L));
}

int openProgram(lua_State* L) {
    luaL_checkstring(L, 1);
    luaL_optstring(L, 2, "r");
    return luaL_error(L, LUA_QL("popen") " not supported");
}

int prompt(lua_State* L) {
    char line[250];
    for (;;) {
        std::fputs("hlua_debug> ", stderr);
        if (std::fgets(line, sizeof line, stdin) == nullptr || std::strcmp(line, "cont\n") == 0) {
            return 0;
        }
        expectAnyChange(L);
        if (luaL_loadbuffer(L, line, std::strlen(line), "=(debug command)") != 0 ||
            lua_pcall(L, 0, 0, 0) != 0) {
            const char* message = lua_tostring(L, -1);
            std::fprintf(stderr, "%s\n", message == nullptr ? "(no message)" : message);
        }
        lua_settop(L, 0);
    }
}

// Stores a loader with the package table as its environment, like the interpreter's own loaders.
// The package table is below the table of loaders on the stack.
void setLoader(lua_State* L, int index, lua_CFunction loader) {
    lua_pushcfunction(L, loader);
    lua_pushvalue(L, -3);
    lua_setfenv(L, -2);
    lua_rawseti(L, -2, index);
}

// Runs the function that is its upvalue, in its place.
int loadCode(lua_State* L) {
    expectAnyChange(L);
    return lua_tocfunction(L, lua_upvalueindex(1))(L);
}

}  // namespace

void reportLoading(lua_State* L) {
    for (const char* name : {"dofile", "load", "loadfile", "loadstring"}) {
        lua_getfield(L, -1, name);
        lua_pushcclosure(L, loadCode, 1);
        lua_setfield(L, -2, name);
    }
}

void disableNativeModules(lua_State* L) {
    lua_pushcfunction(L, loadLibrary);
    lua_setfield(L, -2, "loadlib");
    lua_getfield(L, -1, "loaders");
    // That of scripts in directories.
    lua_rawgeti(L, -1, 2);
    lua_pushcclosure(L, loadCode, 1);
    lua_pushvalue(L, -3);
    lua_setfenv(L, -2);
    lua_rawseti(L, -2, 2);
    setLoader(L, 3, loadNativeModule);
    setLoader(L, 4, loadFromRootModule);
    lua_pop(L, 1);
}

void disablePrograms(lua_State* L) {
    lua_pushcfunction(L, openProgram);
    lua_setfield(L, -2, "popen");
}

void renameDebugPrompt(lua_State* L) {
    lua_pushcfunction(L, prompt);
    lua_setfield(L, -2, "debug");
}

}  // namespace qixlatorlua
