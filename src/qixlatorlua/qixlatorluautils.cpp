#include "qixlatorlua/qixlatorluautils.h"

#include <cstdint>
#include <lua.hpp>
#include <new>

#include "qihtl/String.h"
#include "qisysq/FileLooks.h"
#include "qixlator/qvErrorsParser.h"
#include "qixlatorlua/pathVariables.h"

namespace {

// The working data of the native functions, which they share as an upvalue. It is a Lua userdata,
// since any call into Lua may raise an error that skips the destructors of a function; the next
// function, or the garbage collector, then destroys what is left.
struct Outcome {
    qihtl::String text;
    qierr::Status status;

    void reset() {
        this->~Outcome();
        new (this) Outcome();
    }
};

int endOutcome(lua_State* L) {
    static_cast<Outcome*>(lua_touserdata(L, 1))->reset();
    return 0;
}

void pushOutcome(lua_State* L) {
    new (lua_newuserdata(L, sizeof(Outcome))) Outcome();
    lua_createtable(L, 0, 1);
    lua_pushcfunction(L, endOutcome);
    lua_setfield(L, -2, "__gc");
    lua_setmetatable(L, -2);
}

Outcome* newOutcome(lua_State* L) {
    auto* outcome = static_cast<Outcome*>(lua_touserdata(L, lua_upvalueindex(1)));
    outcome->reset();
    return outcome;
}

// Returns the text to Lua, or raises the failure as a Lua error.
int finish(lua_State* L, Outcome* outcome) {
    const bool failed = outcome->status.code < 0;
    if (failed) {
        qisysq::FileLooks::setIncomplete();
        lua_pushstring(L, outcome->status.json == nullptr ? "{}" : outcome->status.json);
    } else {
        lua_pushlstring(L, outcome->text.c_str(), outcome->text.length());
    }
    outcome->reset();
    return failed ? lua_error(L) : 1;
}

// The same for a search: an empty text is returned as nil.
int finishSearch(lua_State* L, Outcome* outcome) {
    if (outcome->status.code >= 0 && outcome->text.empty()) {
        outcome->reset();
        lua_pushnil(L);
        return 1;
    }
    return finish(L, outcome);
}

std::int32_t checkInt32(lua_State* L, int index) {
    return static_cast<std::int32_t>(luaL_checkinteger(L, index));
}

int mbsToUtf8(lua_State* L) {
    luaL_checkinteger(L, 1);
    luaL_checkstring(L, 2);
    lua_pushvalue(L, 2);
    return 1;
}

int lookupVariable(lua_State* L) {
    luaL_checkstring(L, 1);
    const char* name = luaL_checkstring(L, 2);
    Outcome* outcome = newOutcome(L);
    qixlatorlua::lookupVariable(name, &outcome->text, &outcome->status);
    return finish(L, outcome);
}

int expandPath(lua_State* L) {
    luaL_checkstring(L, 1);
    const char* path = luaL_checkstring(L, 2);
    Outcome* outcome = newOutcome(L);
    qixlatorlua::expandPath(path, &outcome->text, &outcome->status);
    return finish(L, outcome);
}

int convertLangToDir(lua_State* L) {
    const std::int32_t language = checkInt32(L, 1);
    Outcome* outcome = newOutcome(L);
    const char* directory = qixlator::convertLangToDir(language, &outcome->status);
    outcome->text.assign(directory, &outcome->status);
    return finish(L, outcome);
}

int findErrorDescriptionFromErrorsDir(lua_State* L) {
    const char* directory = luaL_checkstring(L, 1);
    const std::int32_t code = checkInt32(L, 2);
    const std::int32_t language = checkInt32(L, 3);
    Outcome* outcome = newOutcome(L);
    qixlator::findErrorDescriptionFromErrorsDir(directory, code, language, &outcome->text,
                                                &outcome->status);
    return finishSearch(L, outcome);
}

int findErrorDescriptionFromDir(lua_State* L) {
    const char* directory = luaL_checkstring(L, 1);
    const std::int32_t code = checkInt32(L, 2);
    Outcome* outcome = newOutcome(L);
    qixlator::findErrorDescriptionFromDir(directory, code, &outcome->text, &outcome->status);
    return finishSearch(L, outcome);
}

}  // namespace

extern "C" int luaopen_qixlatorluautils(lua_State* L) {
    static const luaL_Reg functions[] = {
        {"mbsToUtf8", mbsToUtf8},
        {"lookupVariable", lookupVariable},
        {"expandPath", expandPath},
        {"convertLangToDir", convertLangToDir},
        {"findErrorDescriptionFromErrorsDir", findErrorDescriptionFromErrorsDir},
        {"findErrorDescriptionFromDir", findErrorDescriptionFromDir},
        // Despite its name this function takes a directory too; scripts rely on that.
        {"findErrorDescriptionFromFile", findErrorDescriptionFromDir},
        {nullptr, nullptr},
    };
    pushOutcome(L);
    luaL_openlib(L, "qixlatorluautils", functions, 1);
    return 1;
}
