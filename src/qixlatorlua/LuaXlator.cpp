#include "qixlatorlua/LuaXlator.h"

#include <cstring>
#include <lua.hpp>
#include <new>

#include "qihtl/Allocator.h"
#include "qixlator/qixlator.h"
#include "qixlatorlua/LuaState.h"
#include "qixlatorlua/PreparedStates.h"

// The functions that run inside lua_cpcall must not own resources: a Lua error is a longjmp that
// skips destructors.

namespace qixlatorlua {

namespace {

// ---- Setup --------------------------------------------------------------------------------------

struct Setup {
    const char* name;
    const char* registrationInfo;
};

int setUpProtected(lua_State* L) {
    const auto* setup = static_cast<const Setup*>(lua_touserdata(L, 1));
    lua_getglobal(L, "require");
    lua_pushliteral(L, "qixlatorlua");
    lua_call(L, 1, 0);
    lua_getglobal(L, "qixlatorlua_setupEnv");
    lua_pushstring(L, setup->name);
    lua_pushstring(L, setup->registrationInfo);
    lua_call(L, 2, 0);
    return 0;
}

// This service does not map codes, so the function returns its argument.
int unmapErrorCode(lua_State* L) {
    lua_pushinteger(L, luaL_checkinteger(L, 1));
    return 1;
}

int registerGlobalsProtected(lua_State* L) {
    lua_register(L, "qimxl_unmapErrorCode", unmapErrorCode);
    return 0;
}

bool setUp(lua_State* L, Setup setup, qierr_Status* status) {
    int result = lua_cpcall(L, setUpProtected, &setup);
    if (result == 0) {
        result = lua_cpcall(L, registerGlobalsProtected, nullptr);
    }
    if (result != 0) {
        qierr_Writer writer = reportLuaFailure(L, result, "lua setupEnv failed", status);
        writer = qierr_Writer_addString(writer, "name", setup.name);
        qierr_Writer_addString(writer, "registrationInfo", setup.registrationInfo);
    }
    return result == 0;
}

// A state that is set up: a prepared one, or else a new one.
lua_State* findState(Setup setup, LuaRuntime runtime, qierr_Status* status) {
    const bool isPrepared = runtime == LuaRuntime::Prepared;
    PreparedStates& states = PreparedStates::ofProcess();
    lua_State* L = isPrepared ? states.take(setup.name, setup.registrationInfo) : nullptr;
    if (L != nullptr) {
        return L;
    }
    L = openState(runtime, status);
    if (L == nullptr || !setUp(L, setup, status)) {
        closeState(L);
        return nullptr;
    }
    if (isPrepared) {
        states.add(L, setup.name, setup.registrationInfo);
    }
    return L;
}

// ---- Descriptions -------------------------------------------------------------------------------

// The size in KiB above which the garbage of a state is collected between calls.
constexpr int collectionLimit = 4096;

struct Description {
    const char* function;
    std::int32_t code;
    const char* json;  // null to describe the code
    const char* format;
    std::uint32_t attributes;
    qixlator_Alloc alloc;
    void* allocContext;
    qierr_Status* status;
    char* text;           // the result
    lua_Integer failure;  // or a status code that the script returned
};

int pushArguments(lua_State* L, const Description& description) {
    const std::uint32_t attributes = description.attributes;
    if (description.json == nullptr) {
        lua_pushinteger(L, description.code);
    } else {
        lua_pushstring(L, description.json);
    }
    lua_pushinteger(L, attributes & qixlator_languageMask);
    lua_pushinteger(L, (attributes >> qixlator_adeShift) & qixlator_adeMask);
    if (description.json == nullptr) {
        return 3;
    }
    lua_pushstring(L, description.format);
    return 4;
}

// Calls the function of the script, with the error function of the scripts if there is one.
void callScript(lua_State* L, const Description& description) {
    lua_getglobal(L, "qixlatorlua_errHandler");
    const int handler = lua_isfunction(L, -1) ? lua_gettop(L) : 0;
    lua_getglobal(L, "qixlatorlua_xlator");
    lua_getfield(L, -1, description.function);
    lua_remove(L, -2);
    const int count = pushArguments(L, description);
    if (lua_pcall(L, count, 1, handler) != 0) {
        lua_error(L);
    }
}

int describeProtected(lua_State* L) {
    auto* description = static_cast<Description*>(lua_touserdata(L, 1));
    if (lua_gc(L, LUA_GCCOUNT, 0) > collectionLimit) {
        expectAnyChange(L);
        lua_gc(L, LUA_GCCOLLECT, 0);
    }
    callScript(L, *description);
    if (description->json != nullptr && lua_type(L, -1) == LUA_TNUMBER) {
        description->failure = lua_tointeger(L, -1);
        return 0;
    }
    std::size_t length = 0;
    const char* text = lua_tolstring(L, -1, &length);
    if (text == nullptr) {
        return 0;
    }
    description->text =
        static_cast<char*>(description->alloc(nullptr, static_cast<std::uint32_t>(length + 1),
                                              description->allocContext, description->status));
    if (description->text != nullptr) {
        std::memcpy(description->text, text, length + 1);
    }
    return 0;
}

void reportScriptCode(lua_Integer code, qierr_Status* status) {
    if (!qierr_Status_setCodeNamed(status, static_cast<std::int32_t>(code),
                                   QIERR_HERE_NAMED("(int32_t)lua_tointeger(L, -1)"))) {
        return;
    }
    qierr_Writer writer =
        qierr_Writer_beginObject(qierr_Status_writerAtEnd(status), "qixlatorlua_debug");
    qierr_Writer_addString(writer, "debug", "failed to get dynamic desc");
}

char* describe(XlatorInterface* self, Description* description, const char* failure) {
    if (description->status->code < 0) {
        return nullptr;
    }
    auto* xlator = static_cast<LuaXlator*>(self);
    lua_State* L = xlator->L;
    const int top = lua_gettop(L);
    const int result = lua_cpcall(L, describeProtected, description);
    if (result != 0) {
        reportLuaFailure(L, result, failure, description->status);
    } else if (description->failure != 0) {
        reportScriptCode(description->failure, description->status);
    }
    lua_settop(L, top);
    const bool isCode = description->json == nullptr;
    (isCode ? xlator->describedCode : xlator->describedStatus) |= description->text != nullptr;
    return description->text;
}

char* copyText(const char* text, qixlator_Alloc alloc, void* allocContext, qierr_Status* status) {
    const std::size_t size = std::strlen(text) + 1;
    auto* copy =
        static_cast<char*>(alloc(nullptr, static_cast<std::uint32_t>(size), allocContext, status));
    return copy == nullptr ? nullptr : static_cast<char*>(std::memcpy(copy, text, size));
}

// In a kept state the result depends on files alone, so it is kept too.
char* getStaticDesc(XlatorInterface* self, std::int32_t code, std::uint32_t attributes,
                    qixlator_Alloc alloc, void* allocContext, qierr_Status* status) {
    lua_State* const L = static_cast<LuaXlator*>(self)->L;
    PreparedStates& states = PreparedStates::ofProcess();
    const KeptTexts* const kept = status->code < 0 ? nullptr : states.textsOf(L);
    const char* const known = kept == nullptr ? nullptr : kept->find(code, attributes);
    if (known != nullptr) {
        return copyText(known, alloc, allocContext, status);
    }
    Description description{"getStaticDesc", code,         nullptr, nullptr, attributes,
                            alloc,           allocContext, status,  nullptr, 0};
    char* const text = describe(self, &description, "failed to get static desc");
    const qisysq::LookList* const looks = qisysq::FileLooks::current();
    KeptTexts* const texts = text == nullptr || looks == nullptr ? nullptr : states.textsOf(L);
    if (texts != nullptr) {
        texts->add(code, attributes, *looks, text);
    }
    return text;
}

char* getDynamicDesc(XlatorInterface* self, const char* json, std::uint32_t attributes,
                     const char* format, qixlator_Alloc alloc, void* allocContext,
                     qierr_Status* status) {
    Description description{"getDynamicDesc", 0,      json,    format, attributes, alloc,
                            allocContext,     status, nullptr, 0};
    return describe(self, &description, "failed to get dynamic desc");
}

void destroy(XlatorInterface* self) {
    auto* xlator = static_cast<LuaXlator*>(self);
    if (xlator->describedCode && xlator->describedStatus) {
        noteCompleteTranslation(xlator->L);
    }
    closeState(xlator->L);
    qihtl_realloc(xlator, 0);
}

}  // namespace

XlatorInterface* createLuaXlator(const char* name, const char* registrationInfo, LuaRuntime runtime,
                                 qierr_Status* status) {
    if (status->code < 0) {
        return nullptr;
    }
    void* memory = qihtl_realloc(nullptr, sizeof(LuaXlator));
    if (memory == nullptr) {
        qihtl_reportMemoryFull(status);
        return nullptr;
    }
    auto* xlator =
        new (memory) LuaXlator{{16, destroy, getStaticDesc, getDynamicDesc}, nullptr, false, false};
    xlator->L = findState({name, registrationInfo}, runtime, status);
    if (xlator->L == nullptr) {
        destroy(xlator);
        return nullptr;
    }
    return xlator;
}

}  // namespace qixlatorlua
