#include "embedded/preload.h"

#include <cstdio>
#include <cstring>
#include <lua.hpp>

// These functions must not own resources: a Lua error is a longjmp that skips destructors.

bool isLuaFile(const EmbeddedFile& file) {
    const char* extension = std::strrchr(file.name, '.');
    return extension != nullptr &&
           (std::strcmp(extension, ".lua") == 0 || std::strcmp(extension, ".luac") == 0);
}

unsigned moduleNameLength(const EmbeddedFile& file) {
    return static_cast<unsigned>(std::strrchr(file.name, '.') - file.name);
}

void reportLoadFailure(const char* fileName, const char* message) {
    std::fprintf(stderr, "ERROR: Failed to load \"%s\": %s\n", fileName, message);
}

int addFilesToPreload(lua_State* L, EmbeddedFiles files) {
    int result = 0;
    lua_getglobal(L, "package");
    lua_getfield(L, -1, "preload");
    for (const EmbeddedFile& file : files) {
        if (!isLuaFile(file)) {
            continue;
        }
        lua_pushlstring(L, file.name, moduleNameLength(file));
        if (luaL_loadbuffer(L, file.data, file.size, file.name) == 0) {
            lua_rawset(L, -3);
        } else {
            reportLoadFailure(file.name, lua_tostring(L, -1));
            lua_pop(L, 2);
            result = 1;
        }
    }
    lua_pop(L, 2);
    return result;
}

int addEmbeddedFilesToPreload(lua_State* L) {
    return addFilesToPreload(L, embeddedFiles());
}
