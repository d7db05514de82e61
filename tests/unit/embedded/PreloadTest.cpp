#include "embedded/preload.h"

#include <gtest/gtest.h>

#include <cstring>
#include <lua.hpp>
#include <string>
#include <vector>

namespace {

class PreloadTest : public testing::Test {
  protected:
    PreloadTest() : L(luaL_newstate()) {
        luaL_openlibs(L);
        run("package.path = '' package.cpath = ''");
    }
    ~PreloadTest() override { lua_close(L); }

    // What a chunk returns, as text, or "error: " and the message.
    std::string run(const std::string& chunk) {
        std::string prefix;
        if (luaL_loadbuffer(L, chunk.data(), chunk.size(), "=test") != 0 ||
            lua_pcall(L, 0, 1, 0) != 0) {
            prefix = "error: ";
        }
        const char* text = lua_tostring(L, -1);
        const std::string result = prefix + (text == nullptr ? "(no text)" : text);
        lua_settop(L, 0);
        return result;
    }

    lua_State* L;
};

TEST_F(PreloadTest, TheScriptsFollowTheSchemasInTableOrder) {
    std::vector<std::string> names;
    for (const EmbeddedFile& file : embeddedFiles()) {
        if (isLuaFile(file)) {
            names.push_back(file.name);
        }
    }
    EXPECT_EQ(names, (std::vector<std::string>{
                         "json.lua", "util.lua", "commonTerms_eng.lua", "commonTerms_jpn.lua",
                         "commonTerms_kor.lua", "commonTerms_chs.lua", "commonTerms_fra.lua",
                         "commonTerms_deu.lua", "qimxl_defaultAttrTable.lua", "mxlator.lua",
                         "qimxl_utilities.lua", "qixlatorlua.lua"}));
    EXPECT_EQ(embeddedFiles().end() - embeddedFiles().begin(), 39);
}

TEST_F(PreloadTest, ScriptsAreFoundWithoutASearchPath) {
    EXPECT_EQ(addEmbeddedFilesToPreload(L), 0);
    EXPECT_EQ(run("return type(require('commonTerms_fra'))"), "table");
    EXPECT_EQ(run("return require('commonTerms_eng').getString('kUsageTypeName')"), "Name");
    EXPECT_EQ(lua_gettop(L), 0);
}

TEST_F(PreloadTest, SchemasAreNotModules) {
    addEmbeddedFilesToPreload(L);
    EXPECT_EQ(run("return require('definitions')").find("error: "), 0u);
    EXPECT_EQ(run("return tostring(package.preload['definitions'])"), "nil");
}

TEST_F(PreloadTest, TheChunkNameIsTheFileName) {
    addEmbeddedFilesToPreload(L);
    EXPECT_EQ(run("return debug.getinfo(require('json').decode, 'S').source"), "json.lua");
}

TEST_F(PreloadTest, ABadFileIsReportedAndTheOthersAreInstalled) {
    static const EmbeddedFile files[] = {
        {"first.lua", "return 1", 8}, {"bad.lua", "return +", 8},  {"noextension", "return +", 8},
        {"notes.txt", "return +", 8}, {"a.b.luac", "return 2", 8}, {"last.lua", "return 3", 8},
    };
    testing::internal::CaptureStderr();
    EXPECT_EQ(addFilesToPreload(L, {files, files + 6}), 1);
    EXPECT_EQ(testing::internal::GetCapturedStderr(),
              "ERROR: Failed to load \"bad.lua\": [string \"bad.lua\"]:1: unexpected symbol near "
              "'+'\n");
    EXPECT_EQ(run("return require('first')"), "1");
    EXPECT_EQ(run("return require('a.b')"), "2");
    EXPECT_EQ(run("return require('last')"), "3");
    EXPECT_EQ(run("return tostring(package.preload.bad)"), "nil");
    EXPECT_EQ(run("return tostring(package.preload.noextension or package.preload.notes)"), "nil");
    EXPECT_EQ(lua_gettop(L), 0);
}

// ---- The module json ----------------------------------------------------------------------------

class JsonModuleTest : public PreloadTest {
  protected:
    JsonModuleTest() {
        addEmbeddedFilesToPreload(L);
        run("json = require('json')");
    }

    std::string decodedType(const std::string& text) {
        return run("return type((json.decode([==[" + text + "]==])))");
    }
};

TEST_F(JsonModuleTest, DecodesEachKindOfValue) {
    EXPECT_EQ(run("return tostring(json.decode(' true '))"), "true");
    EXPECT_EQ(run("return tostring(json.decode('false'))"), "false");
    EXPECT_EQ(run("return tostring((json.decode('null')))"), "nil");
    EXPECT_EQ(run("return json.decode('-12.5')"), "-12.5");
    EXPECT_EQ(run("return json.decode('1.5e+3')"), "1500");
    EXPECT_EQ(run("return json.decode('0')"), "0");
    EXPECT_EQ(run("return json.decode('\"text\"')"), "text");
    EXPECT_EQ(run("local a = json.decode('[1, [2], 3]') return a[3] .. ' ' .. a[2][1]"), "3 2");
    EXPECT_EQ(run("local o = json.decode('{\"a\": {\"b\": 1}, \"\": \"x\"}') "
                  "return o.a.b .. ' ' .. o['']"),
              "1 x");
    EXPECT_EQ(run("return tostring(next((json.decode('[ ]'))) or next((json.decode('{ }'))))"),
              "nil");
}

TEST_F(JsonModuleTest, ReturnsThePositionAfterTheValue) {
    EXPECT_EQ(run("return (select(2, json.decode('[1]  x')))"), "6");
    EXPECT_EQ(run("return (json.decode('1 2', 3))"), "2");
}

TEST_F(JsonModuleTest, ANullInAnArrayLeavesItsIndexEmpty) {
    EXPECT_EQ(run("local a = json.decode('[null, 2]') "
                  "return tostring(a[1]) .. ' ' .. a[2]"),
              "nil 2");
    EXPECT_EQ(run("return tostring(next((json.decode('{\"a\": null}'))))"), "nil");
}

TEST_F(JsonModuleTest, ResolvesEscapes) {
    EXPECT_EQ(run(R"(return json.decode([["\"\\\/\b\f\n\r\t"]]))"), "\"\\/\b\f\n\r\t");
    EXPECT_EQ(run(R"(return json.decode([["\u0041\u00E9\u20ac\ud83d\ude00"]]))"),
              "A\xC3\xA9\xE2\x82\xAC\xF0\x9F\x98\x80");
}

TEST_F(JsonModuleTest, RefusesWhatIsNotJson) {
    for (const char* text : {"",
                             " ",
                             "{",
                             "[",
                             "[1",
                             "[1,]",
                             "[,1]",
                             "{\"a\"}",
                             "{\"a\":}",
                             "{\"a\":1,}",
                             "{a:1}",
                             "nul",
                             "nullx",
                             "True",
                             "os.exit()",
                             "-",
                             "+1",
                             ".5",
                             "\"",
                             "\"a\n\"",
                             "\"\\x\"",
                             "\"\\u12G4\"",
                             "\"\\ud800\"",
                             "\"\\ud800\\u0041\"",
                             "\"\\udc00\"",
                             "'a'",
                             "[1 2]"}) {
        EXPECT_EQ(
            run("return json.decode([==[\n" + std::string(text) + "]==])").find("error: json: "),
            0u)
            << text;
    }
}

TEST_F(JsonModuleTest, DoesNotRunTheInput) {
    run("ran = false function touch() ran = true return 1 end");
    EXPECT_EQ(run("return json.decode('touch()')").find("error: "), 0u);
    EXPECT_EQ(run("return json.decode('[touch()]')").find("error: "), 0u);
    EXPECT_EQ(run("return tostring(ran)"), "false");
}

TEST_F(JsonModuleTest, DeepNestingIsAnError) {
    EXPECT_EQ(run("return tostring((pcall(json.decode, ('['):rep(1000000))))"), "false");
}

TEST_F(JsonModuleTest, EncodesEachKindOfValue) {
    EXPECT_EQ(run("return json.encode(nil)"), "null");
    EXPECT_EQ(run("return json.encode(json.null)"), "null");
    EXPECT_EQ(run("return json.encode(true)"), "true");
    EXPECT_EQ(run("return json.encode(-1.5)"), "-1.5");
    EXPECT_EQ(run("return json.encode(4294967295)"), "4294967295");
    EXPECT_EQ(run(R"(return json.encode('a"\\\n\1\127)"
                  "\xC3\xA9')"),
              R"("a\"\\\n\u0001\u007f)"
              "\xC3\xA9\"");
    EXPECT_EQ(run("return json.encode({1, {'x'}, json.null})"), "[1,[\"x\"],null]");
    EXPECT_EQ(run("return json.encode({a = {b = {}}})"), "{\"a\":{\"b\":[]}}");
    EXPECT_EQ(run("return json.encode(0/0)").find("error: json: "), 0u);
    EXPECT_EQ(run("return json.encode(math.huge)").find("error: json: "), 0u);
    EXPECT_EQ(run("return json.encode(print)").find("error: json: "), 0u);
}

TEST_F(JsonModuleTest, WhatItEncodesItDecodes) {
    EXPECT_EQ(run("return json.decode(json.encode({x = {'a\"b\\\\c\\n'}})).x[1]"), "a\"b\\c\n");
}

}  // namespace
