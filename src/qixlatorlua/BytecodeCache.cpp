#include "qixlatorlua/BytecodeCache.h"

#include <cstring>
#include <lua.hpp>
#include <new>
#include <utility>

#include "embedded/preload.h"
#include "qixlatorlua/LuaMemory.h"
#include "qixlatorlua/LuaState.h"

namespace qixlatorlua {

namespace {

struct Dump {
    qihtl::String* bytecode;
    qierr_Status* status;
};

int writeDump(lua_State*, const void* data, std::size_t size, void* context) {
    const auto* dump = static_cast<const Dump*>(context);
    dump->bytecode->append(static_cast<const char*>(data), static_cast<std::uint32_t>(size),
                           dump->status);
    return dump->status->code < 0;
}

}  // namespace

BytecodeCache::BytecodeCache(EmbeddedFiles files, qierr_Status* status) {
    // Nothing below raises a Lua error, since loading is protected.
    lua_State* L = lua_newstate(allocatePlainly, nullptr);
    if (L == nullptr) {
        qihtl_reportMemoryFull(status);
        return;
    }
    for (const EmbeddedFile& file : files) {
        if (isLuaFile(file) && status->code >= 0) {
            check(L, file, status);
        }
    }
    lua_close(L);
}

void BytecodeCache::check(lua_State* L, const EmbeddedFile& file, qierr_Status* status) {
    Script script{&file, moduleNameLength(file), {}, {}};
    const int result = luaL_loadbuffer(L, file.data, file.size, file.name);
    if (result == LUA_ERRMEM) {
        qihtl_reportMemoryFull(status);
    } else if (result != 0) {
        script.failure.assign(lua_tostring(L, -1), status);
    }
    lua_settop(L, 0);
    scripts.append(std::move(script), status);
}

const BytecodeCache* BytecodeCache::ofEmbeddedFiles() {
    // If the constructor throws, the static object is constructed again at the next call.
    struct Complete : BytecodeCache {
        explicit Complete(qierr::Status&& status) : BytecodeCache(embeddedFiles(), &status) {
            if (status.code < 0) {
                throw std::bad_alloc();
            }
        }
    };
    try {
        static const Complete cache{qierr::Status()};
        return &cache;
    } catch (const std::bad_alloc&) {
        return nullptr;
    }
}

BytecodeCache::Script* BytecodeCache::find(const char* module, std::size_t length) const {
    for (Script& script : scripts) {
        if (script.failure.empty() && script.nameLength == length &&
            std::memcmp(script.file->name, module, length) == 0) {
            return &script;
        }
    }
    return nullptr;
}

int BytecodeCache::push(lua_State* L, Script* script) const {
    const char* name = script->file->name;
    mutex.lock();
    const bool isCompiled = !script->bytecode.empty();
    mutex.unlock();
    if (isCompiled) {
        return luaL_loadbuffer(L, script->bytecode.c_str(), script->bytecode.length(), name);
    }
    const int result = luaL_loadbuffer(L, script->file->data, script->file->size, name);
    if (result == 0) {
        keepBytecode(L, script);
    }
    return result;
}

// Stores the bytecode of the function on top of the stack. Raises no Lua error. If memory runs out
// nothing is stored, and the next state compiles the script again.
void BytecodeCache::keepBytecode(lua_State* L, Script* script) const {
    qierr::Status status;
    qihtl::String bytecode;
    Dump dump{&bytecode, &status};
    lua_dump(L, writeDump, &dump);
    // The cache is kept until the process ends, so unused capacity is released.
    bytecode.shrink();
    const std::lock_guard<std::mutex> lock(mutex);
    if (status.code >= 0 && script->bytecode.empty()) {
        script->bytecode.assign(bytecode.c_str(), bytecode.length(), &status);
    }
}

// The __index function of package.preload. Its arguments are that table and the name of a module.
int BytecodeCache::load(lua_State* L) {
    const auto* cache = static_cast<const BytecodeCache*>(lua_touserdata(L, lua_upvalueindex(1)));
    std::size_t length = 0;
    const char* module = lua_tolstring(L, 2, &length);
    Script* script = module == nullptr ? nullptr : cache->find(module, length);
    if (script == nullptr) {
        return 0;
    }
    expectAnyChange(L);
    if (cache->push(L, script) != 0) {
        return lua_error(L);
    }
    lua_pushvalue(L, 2);
    lua_pushvalue(L, -2);
    lua_rawset(L, 1);
    return 1;
}

int BytecodeCache::install(lua_State* L) const {
    lua_getglobal(L, "package");
    lua_getfield(L, -1, "preload");
    lua_newtable(L);
    // The __index function does not modify the cache.
    lua_pushlightuserdata(L, const_cast<BytecodeCache*>(this));
    lua_pushcclosure(L, load, 1);
    lua_setfield(L, -2, "__index");
    lua_setmetatable(L, -2);
    lua_pop(L, 2);
    int result = 0;
    for (const Script& script : scripts) {
        if (!script.failure.empty()) {
            reportLoadFailure(script.file->name, script.failure.c_str());
            result = 1;
        }
    }
    return result;
}

std::uint64_t BytecodeCache::size() const {
    const std::lock_guard<std::mutex> lock(mutex);
    std::uint64_t bytes = 0;
    for (const Script& script : scripts) {
        bytes += script.bytecode.length();
    }
    return bytes;
}

}  // namespace qixlatorlua
