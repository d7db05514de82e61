#include "qixlatorlua/BytecodeCache.h"

#include <gtest/gtest.h>

#include <cstring>
#include <iterator>
#include <lua.hpp>
#include <string>

#include "embedded/preload.h"
#include "support/FaultyAllocator.h"

namespace {

using qixlatorlua::BytecodeCache;

EmbeddedFile file(const char* name, const char* text) {
    return {name, text, static_cast<std::uint32_t>(std::strlen(text))};
}

const EmbeddedFile files[] = {
    file("good.lua",
         "local good = {}\nfunction good.fail(x)\n  local y = x .. nil return y\nend\nreturn good"),
    file("bad.lua", "return +"),
    file("failing.lua", "local good = require('good')\n\nlocal y = good.fail('x') return y"),
    file("worse.lua", "x = = 1"),
    file("notes.txt", "return +"),
    file("dotted.name.lua", "return ..."),
};
const EmbeddedFiles table = {files, files + std::size(files)};

// The outcome of a chunk in a state whose modules come from source or from the cache.
struct Outcome {
    int installed;
    std::string lines;
    std::string result;
};

int addTraceback(lua_State* L) {
    lua_getglobal(L, "debug");
    lua_getfield(L, -1, "traceback");
    lua_pushvalue(L, 1);
    lua_call(L, 1, 1);
    return 1;
}

Outcome run(const BytecodeCache* cache, const std::string& chunk) {
    lua_State* L = luaL_newstate();
    luaL_openlibs(L);
    luaL_dostring(L, "package.path = '' package.cpath = ''");
    Outcome outcome;
    testing::internal::CaptureStderr();
    outcome.installed = cache == nullptr ? addFilesToPreload(L, table) : cache->install(L);
    outcome.lines = testing::internal::GetCapturedStderr();
    EXPECT_EQ(lua_gettop(L), 0);
    lua_pushcfunction(L, addTraceback);
    luaL_loadbuffer(L, chunk.data(), chunk.size(), "=test");
    lua_pcall(L, 0, 1, 1);
    outcome.result = lua_tostring(L, -1);
    lua_close(L);
    return outcome;
}

TEST(BytecodeCacheTest, BehavesLikeTheSource) {
    qierr::Status status;
    const BytecodeCache cache(table, &status);
    ASSERT_EQ(status.code, 0);
    for (const char* chunk :
         {"return type(require('good').fail)", "return require('good').fail('x')",
          "return require('failing')", "return require('bad')", "return require('worse')",
          "return require('notes')", "return require('missing')", "return require('dotted.name')",
          "require('good') return tostring(require('good'))",
          "return debug.getinfo(require('good').fail, 'S').source .. "
          "debug.getinfo(require('good').fail, 'S').linedefined",
          "return tostring(package.preload.good == package.preload.good)",
          "return type(package.preload.good)", "return type(package.preload[1])",
          "package.preload.mine = function() return 'mine' end return require('mine')"}) {
        const Outcome source = run(nullptr, chunk);
        const Outcome bytecode = run(&cache, chunk);
        EXPECT_EQ(bytecode.installed, 1);
        EXPECT_EQ(source.installed, bytecode.installed);
        EXPECT_EQ(source.lines, bytecode.lines);
        if (std::strstr(chunk, "tostring(require") == nullptr) {
            EXPECT_EQ(source.result, bytecode.result) << chunk;
        }
    }
}

TEST(BytecodeCacheTest, ErrorsNameTheLinesOfTheScripts) {
    qierr::Status status;
    const BytecodeCache cache(table, &status);
    const std::string error = run(&cache, "return require('failing')").result;
    EXPECT_EQ(error.find("[string \"good.lua\"]:3: attempt to concatenate a nil value\n"), 0u)
        << error;
    EXPECT_NE(std::string::npos, error.find("\t[string \"good.lua\"]:3: in function 'fail'\n"
                                            "\t[string \"failing.lua\"]:3: in main chunk\n"
                                            "\t[C]: in function 'require'\n"))
        << error;
}

TEST(BytecodeCacheTest, TheLineOfABadScriptIsWrittenForEachState) {
    qierr::Status status;
    const BytecodeCache cache(table, &status);
    for (int state = 0; state < 2; ++state) {
        EXPECT_EQ(
            run(&cache, "return ''").lines,
            "ERROR: Failed to load \"bad.lua\": [string \"bad.lua\"]:1: unexpected symbol near "
            "'+'\n"
            "ERROR: Failed to load \"worse.lua\": [string \"worse.lua\"]:1: unexpected symbol near "
            "'='\n");
    }
}

TEST(BytecodeCacheTest, LackOfMemoryAtAnyAllocationIsReported) {
    const std::int64_t before = FaultyAllocator::liveBlocks();
    std::uint64_t number = 0;
    for (;; ++number) {
        qierr::Status status;
        FaultyAllocator::failAt(number);
        { const BytecodeCache cache(table, &status); }
        const bool failed = FaultyAllocator::hasFailed();
        FaultyAllocator::succeed();
        ASSERT_EQ(FaultyAllocator::liveBlocks(), before) << "request " << number;
        if (!failed) {
            EXPECT_EQ(status.code, 0);
            break;
        }
        ASSERT_EQ(status.code, -52000) << "request " << number;
    }
    EXPECT_LT(100u, number);
}

}  // namespace
