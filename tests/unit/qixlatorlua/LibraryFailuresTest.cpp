#include <gtest/gtest.h>

#include <lua.hpp>
#include <string>

#include "ScriptHost.h"

namespace {

using qixlatorlua::LuaRuntime;

// Called in addition when the library of folders is opened.
int (*openingFolders)(lua_State* L) = nullptr;
// What adding the embedded scripts returns instead of adding them; 0 to add them.
int preloadResult = 0;

// Expects that no translator is made, and that the status says why.
void expectNoTranslator(LuaRuntime runtime, const std::string& code, const std::string& message,
                        const std::string& debug) {
    const ScriptHost host(runtime);
    qierr::Status status;
    EXPECT_EQ(host.create(host.registration("chunk"), &status), nullptr);
    EXPECT_EQ(status.code, -52003);
    EXPECT_TRUE(
        reported(status, "\"error_constant\":\"qiapalerr_softwareFaultAPALInternalUseOnly\""))
        << status.json;
    EXPECT_TRUE(reported(status, "\"internal_error\":{\"api\":\"lua\",\"code\":" + code +
                                     ",\"string\":\"" + message + "\"},\"qixlatorlua_debug\":{" +
                                     debug + "}}"))
        << status.json;
}

class LibraryFailuresTest : public testing::TestWithParam<LuaRuntime> {
  protected:
    ~LibraryFailuresTest() override { openingFolders = nullptr; }
};

INSTANTIATE_TEST_SUITE_P(Runtimes, LibraryFailuresTest,
                         testing::Values(LuaRuntime::Plain, LuaRuntime::Fast),
                         [](const testing::TestParamInfo<LuaRuntime>& runtime) {
                             return runtime.param == LuaRuntime::Plain ? "Plain" : "Fast";
                         });

TEST_P(LibraryFailuresTest, ALibraryThatCannotBeOpenedIsNamed) {
    openingFolders = [](lua_State* L) {
        lua_pushliteral(L, "folders are not there");
        return lua_error(L);
    };
    expectNoTranslator(GetParam(), "2", "folders are not there",
                       "\"debug\":\"failed to load lua lib\",\"lib\":\"lfs\"");
}

TEST_P(LibraryFailuresTest, AStateWithoutATableForPreloadsIsReported) {
    openingFolders = [](lua_State* L) {
        lua_pushnil(L);
        lua_setglobal(L, "package");
        return 0;
    };
    expectNoTranslator(GetParam(), "2", "attempt to index a nil value",
                       "\"debug\":\"failed to add embedded modules to preload table\"");
}

// The fast runtime compiles these scripts only once per process.
TEST(EmbeddedScriptFailuresTest, AnEmbeddedScriptThatCannotBeAddedIsReported) {
    preloadResult = 1;
    expectNoTranslator(LuaRuntime::Plain, "0", "",
                       "\"debug\":\"failed to add embedded modules to preload table\"");
    preloadResult = 0;
}

}  // namespace

extern "C" {
int __real_luaopen_lfs(lua_State* L);
int __real__Z25addEmbeddedFilesToPreloadP9lua_State(lua_State* L);

int __wrap_luaopen_lfs(lua_State* L) {
    if (openingFolders != nullptr) {
        openingFolders(L);
    }
    return __real_luaopen_lfs(L);
}

int __wrap__Z25addEmbeddedFilesToPreloadP9lua_State(lua_State* L) {
    return preloadResult != 0 ? preloadResult : __real__Z25addEmbeddedFilesToPreloadP9lua_State(L);
}
}
