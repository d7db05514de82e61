#include "qixlatorlua/LuaState.h"

#include <cstdio>
#include <lua.hpp>
#include <new>

#include "embedded/preload.h"
#include "qixlatorlua/BytecodeCache.h"
#include "qixlatorlua/LuaMemory.h"
#include "qixlatorlua/PreparedStates.h"
#include "qixlatorlua/closing.h"
#include "qixlatorlua/libraries.h"

namespace qixlatorlua {

namespace {

lua_State* newPlainState() {
    return lua_newstate(allocatePlainly, nullptr);
}

lua_State* newFastState() {
    void* memory = qihtl_realloc(nullptr, sizeof(LuaArena));
    if (memory == nullptr) {
        return nullptr;
    }
    auto* arena = new (memory) LuaArena();
    lua_State* L = lua_newstate(LuaArena::allocate, arena);
    if (L == nullptr || lua_cpcall(L, prepareClosing, nullptr) != 0) {
        arena->~LuaArena();
        qihtl_realloc(arena, 0);
        return nullptr;
    }
    // A state is used for one translation, so its garbage is freed with it. Only a state that grows
    // unusually large is collected earlier (collectionLimit).
    lua_gc(L, LUA_GCSTOP, 0);
    return L;
}

int openLibraryProtected(lua_State* L) {
    openLibrary(L, *static_cast<const LuaLibrary*>(lua_touserdata(L, 1)));
    return 0;
}

bool openLibraries(lua_State* L, qierr_Status* status) {
    for (const LuaLibrary* library = libraries; library->name != nullptr; ++library) {
        const int result = lua_cpcall(L, openLibraryProtected, const_cast<LuaLibrary*>(library));
        if (result != 0) {
            qierr_Writer writer = reportLuaFailure(L, result, "failed to load lua lib", status);
            qierr_Writer_addString(writer, "lib", library->name);
            return false;
        }
    }
    return true;
}

struct Preload {
    // Null to compile each script.
    const BytecodeCache* cache;
    int result;
};

int preloadProtected(lua_State* L) {
    auto* preload = static_cast<Preload*>(lua_touserdata(L, 1));
    preload->result =
        preload->cache == nullptr ? addEmbeddedFilesToPreload(L) : preload->cache->install(L);
    return 0;
}

bool preloadScripts(lua_State* L, LuaRuntime runtime, qierr_Status* status) {
    Preload preload{runtime == LuaRuntime::Plain ? nullptr : BytecodeCache::ofEmbeddedFiles(), 0};
    const int result = lua_cpcall(L, preloadProtected, &preload);
    if (result != 0 || preload.result != 0) {
        reportLuaFailure(L, result, "failed to add embedded modules to preload table", status);
        return false;
    }
    return true;
}

void reportNoState(qierr_Status* status) {
    qierr_Status_setCodeNamed(status, qiapalerr_memoryFull,
                              QIERR_HERE_NAMED("qiapalerr_memoryFull"));
    qierr_Writer writer =
        qierr_Writer_beginObject(qierr_Status_writerAtEnd(status), "qixlatorlua_debug");
    qierr_Writer_addString(writer, "debug", "failed to create lua state");
}

// The string or number on top of the stack as text, "" for any other value. A number is formatted
// into `buffer`: lua_tostring could raise an error, and no protected call would catch it here.
const char* messageOnTop(lua_State* L, char* buffer, std::size_t size) {
    switch (lua_gettop(L) == 0 ? LUA_TNONE : lua_type(L, -1)) {
        case LUA_TSTRING:
            return lua_tostring(L, -1);
        case LUA_TNUMBER:
            std::snprintf(buffer, size, LUA_NUMBER_FMT, lua_tonumber(L, -1));
            return buffer;
        default:
            return "";
    }
}

}  // namespace

lua_State* openState(LuaRuntime runtime, qierr_Status* status) {
    lua_State* L = runtime == LuaRuntime::Plain ? newPlainState() : newFastState();
    if (L == nullptr) {
        reportNoState(status);
        return nullptr;
    }
    if (!openLibraries(L, status) || !preloadScripts(L, runtime, status)) {
        closeState(L);
        return nullptr;
    }
    return L;
}

void closeState(lua_State* L) {
    if (L == nullptr) {
        return;
    }
    LuaArena* arena = arenaOf(L);
    if (arena == nullptr) {
        lua_close(L);
    } else {
        PreparedStates::ofProcess().close(L, arena);
    }
}

LuaArena* arenaOf(lua_State* L) {
    void* context = nullptr;
    lua_getallocf(L, &context);
    return static_cast<LuaArena*>(context);
}

void expectAnyChange(lua_State* L) {
    LuaArena* arena = arenaOf(L);
    if (arena != nullptr) {
        arena->mayChangeAll();
    }
}

void noteCompleteTranslation(lua_State* L) {
    LuaArena* arena = arenaOf(L);
    if (arena != nullptr) {
        arena->noteCompleteTranslation();
    }
}

qierr_Writer reportLuaFailure(lua_State* L, int result, const char* what, qierr_Status* status) {
    if (!qierr_Status_setCodeNamed(
            status, qiapalerr_softwareFaultAPALInternalUseOnly,
            QIERR_HERE_NAMED("qiapalerr_softwareFaultAPALInternalUseOnly"))) {
        return qierr_Writer{nullptr, nullptr, nullptr};
    }
    char number[LUAI_MAXNUMBER2STR];
    const char* message = messageOnTop(L, number, sizeof number);
    qierr_Writer writer = qierr_Status_writerAtEnd(status);
    writer = qierr_Writer_beginObject(writer, "internal_error");
    writer = qierr_Writer_addString(writer, "api", "lua");
    writer = qierr_Writer_addInt(writer, "code", result);
    writer = qierr_Writer_addString(writer, "string", message);
    writer = qierr_Writer_endObject(writer);
    writer = qierr_Writer_beginObject(writer, "qixlatorlua_debug");
    return qierr_Writer_addString(writer, "debug", what);
}

}  // namespace qixlatorlua
