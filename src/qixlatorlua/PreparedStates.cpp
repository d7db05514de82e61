#include "qixlatorlua/PreparedStates.h"

#include <algorithm>
#include <iterator>
#include <lua.hpp>
#include <new>

#include "qixlatorlua/LuaState.h"
#include "qixlatorlua/closing.h"

// The functions that run inside lua_cpcall must not own resources: a Lua error is a longjmp that
// skips destructors.

namespace qixlatorlua {

namespace {

// What the translator loads for nearly every status: the service always answers in English.
constexpr const char* usualModules[] = {"commonTerms_eng", "qimxl_defaultAttrTable"};

using Lock = std::lock_guard<std::mutex>;

// The JSON module has a buffer outside the memory of the state. Its function encode_keep_buffer
// frees the buffer when called with false, and allocates a new one when called with true.
void setJsonBuffer(lua_State* L, bool isKept) {
    lua_getfield(L, LUA_REGISTRYINDEX, "_LOADED");
    lua_getfield(L, -1, "cjson");
    lua_getfield(L, -1, "encode_keep_buffer");
    lua_pushboolean(L, isKept);
    lua_call(L, 1, 0);
    lua_pop(L, 2);
}

int addJsonBufferProtected(lua_State* L) {
    setJsonBuffer(L, true);
    return 0;
}

bool hasNoSearchPath(lua_State* L) {
    lua_getglobal(L, "package");
    lua_getfield(L, -1, "path");
    const char* path = lua_tostring(L, -1);
    const bool hasNone = path != nullptr && path[0] == '\0';
    lua_pop(L, 2);
    return hasNone;
}

// The modules are loaded; a script that is required once more is loaded from the bytecode again.
// Without bytecode (see BytecodeCache) the table is the only place of the scripts.
void forgetLoadedScripts(lua_State* L) {
    lua_getglobal(L, "package");
    lua_getfield(L, -1, "preload");
    if (lua_getmetatable(L, -1) != 0) {
        lua_pop(L, 1);
        lua_pushnil(L);
        while (lua_next(L, -2) != 0) {
            lua_pop(L, 1);
            lua_pushvalue(L, -1);
            lua_pushnil(L);
            lua_rawset(L, -4);
        }
    }
    lua_pop(L, 2);
}

int prepareProtected(lua_State* L) {
    auto* isPrepared = static_cast<bool*>(lua_touserdata(L, 1));
    if (!hasNoSearchPath(L)) {
        return 0;
    }
    // The garbage of setting up need not be copied.
    lua_gc(L, LUA_GCCOLLECT, 0);
    for (const char* module : usualModules) {
        lua_getglobal(L, "require");
        lua_pushstring(L, module);
        lua_call(L, 1, 0);
    }
    forgetLoadedScripts(L);
    setJsonBuffer(L, false);
    *isPrepared = true;
    return 0;
}

// To as many elements as a translation needs. A collection makes the stack smaller again.
int enlargeStackProtected(lua_State* L) {
    luaL_checkstack(L, 100, "");
    return 0;
}

// Calls a function with an unchanged stack afterwards.
bool call(lua_State* L, lua_CFunction function, void* argument) {
    const int top = lua_gettop(L);
    const int result = lua_cpcall(L, function, argument);
    lua_settop(L, top);
    return result == 0;
}

void destroy(LuaArena* arena) {
    arena->~LuaArena();
    qihtl_realloc(arena, 0);
}

}  // namespace

PreparedStates& PreparedStates::ofProcess() {
    static PreparedStates states;
    return states;
}

PreparedStates::~PreparedStates() {
    clear();
}

PreparedStates::Slot* PreparedStates::findIdle(const char* name, const char* registrationInfo) {
    for (Slot& slot : slots) {
        if (!slot.isUsed && slot.arena != nullptr && slot.name.equals(name) &&
            slot.registrationInfo.equals(registrationInfo)) {
            return &slot;
        }
    }
    return nullptr;
}

bool PreparedStates::areAllUsed() const {
    return std::all_of(std::begin(slots), std::end(slots),
                       [](const Slot& slot) { return slot.isUsed; });
}

lua_State* PreparedStates::take(const char* name, const char* registrationInfo) {
    std::unique_lock<std::mutex> lock(mutex);
    if (areAllUsed()) {
        givenBack.wait_for(lock, patience, [this] { return !areAllUsed(); });
    }
    Slot* slot = findIdle(name, registrationInfo);
    if (slot == nullptr) {
        return nullptr;
    }
    slot->isUsed = true;
    lock.unlock();
    slot->arena->restore();
    if (!call(slot->L, addJsonBufferProtected, nullptr)) {
        close(slot->L, slot->arena);
        return nullptr;
    }
    return slot->L;
}

bool PreparedStates::keep(lua_State* L, LuaArena* arena) {
    bool isPrepared = false;
    call(L, prepareProtected, &isPrepared);
    if (!isPrepared) {
        return false;
    }
    lua_gc(L, LUA_GCCOLLECT, 0);
    lua_gc(L, LUA_GCSTOP, 0);
    const bool isKept = call(L, enlargeStackProtected, nullptr) &&
                        arena->usedSize() <= maximumSize && arena->keep();
    call(L, addJsonBufferProtected, nullptr);
    return isKept;
}

void PreparedStates::add(lua_State* L, const char* name, const char* registrationInfo) {
    Slot* slot = reserve();
    if (slot == nullptr) {
        return;
    }
    LuaArena* arena = arenaOf(L);
    qierr::Status status;
    slot->name.assign(name, &status);
    slot->registrationInfo.assign(registrationInfo, &status);
    const bool isKept = status.code >= 0 && keep(L, arena);
    {
        const Lock lock(mutex);
        if (isKept) {
            slot->L = L;
            slot->arena = arena;
        } else {
            empty(slot);
        }
    }
    givenBack.notify_one();
}

PreparedStates::Slot* PreparedStates::reserve() {
    const Lock lock(mutex);
    Slot* found = nullptr;
    for (Slot& slot : slots) {
        if (!slot.isUsed && (found == nullptr || found->arena != nullptr)) {
            found = &slot;
        }
    }
    if (found != nullptr) {
        empty(found);
        found->isUsed = true;
    }
    return found;
}

void PreparedStates::empty(Slot* slot) {
    if (slot->arena != nullptr) {
        destroy(slot->arena);
    }
    slot->~Slot();
    new (slot) Slot();
}

KeptTexts* PreparedStates::textsOf(lua_State* L) {
    const LuaArena* arena = arenaOf(L);
    if (arena == nullptr || !arena->isKept() || arena->isAnythingChanged()) {
        return nullptr;
    }
    const Lock lock(mutex);
    for (Slot& slot : slots) {
        if (slot.L == L) {
            return &slot.texts;
        }
    }
    return nullptr;
}

void PreparedStates::close(lua_State* L, LuaArena* arena) {
    closeWithoutFreeing(L);
    if (!arena->isKept()) {
        destroy(arena);
        return;
    }
    arena->release();
    {
        const Lock lock(mutex);
        for (Slot& slot : slots) {
            slot.isUsed = slot.isUsed && slot.arena != arena;
        }
    }
    givenBack.notify_one();
}

void PreparedStates::clear() {
    const Lock lock(mutex);
    for (Slot& slot : slots) {
        if (!slot.isUsed) {
            empty(&slot);
        }
    }
}

std::size_t PreparedStates::size() {
    const Lock lock(mutex);
    std::size_t bytes = 0;
    for (const Slot& slot : slots) {
        bytes += slot.isUsed || slot.arena == nullptr ? 0 : slot.arena->keptSize();
    }
    return bytes;
}

}  // namespace qixlatorlua
