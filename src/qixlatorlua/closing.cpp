#include "qixlatorlua/closing.h"

#include <csetjmp>
#include <lua.hpp>

#include "qixlatorlua/LuaState.h"

namespace qixlatorlua {

namespace {

// Its address is the key of the userdata in the registry.
char registryKey;

// lua_close calls the finalizers from the newest userdata to the oldest, so this one is the last. A
// script that removes it from the registry only makes lua_close run to its end.
int finalizeLast(lua_State* L) {
    std::jmp_buf* end = arenaOf(L)->closing;
    if (end != nullptr) {
        std::longjmp(*end, 1);
    }
    return 0;
}

}  // namespace

int prepareClosing(lua_State* L) {
    lua_pushlightuserdata(L, &registryKey);
    lua_newuserdata(L, 0);
    lua_createtable(L, 0, 1);
    lua_pushcfunction(L, finalizeLast);
    lua_setfield(L, -2, "__gc");
    lua_setmetatable(L, -2);
    lua_rawset(L, LUA_REGISTRYINDEX);
    return 0;
}

void closeWithoutFreeing(lua_State* L) {
    std::jmp_buf end;
    LuaArena* const arena = arenaOf(L);
    arena->closing = &end;
    if (setjmp(end) == 0) {
        lua_close(L);
    }
    arena->closing = nullptr;
}

}  // namespace qixlatorlua
