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
    EXPECT_EQ((std::vector<std::string>{"json.lua", "util.lua", "commonTerms_eng.lua",
                                        "commonTerms_jpn.lua", "commonTerms_kor.lua",
                                        "commonTerms_chs.lua", "commonTerms_fra.lua",
                                        "commonTerms_deu.lua", "qimxl_defaultAttrTable.lua",
                                        "mxlator.lua", "qimxl_utilities.lua", "qixlatorlua.lua"}),
              names);
    EXPECT_EQ(39, embeddedFiles().end() - embeddedFiles().begin());
}

TEST_F(PreloadTest, ScriptsAreFoundWithoutASearchPath) {
    EXPECT_EQ(0, addEmbeddedFilesToPreload(L));
    EXPECT_EQ("table", run("return type(require('commonTerms_fra'))"));
    EXPECT_EQ("Name", run("return require('commonTerms_eng').getString('kUsageTypeName')"));
    EXPECT_EQ(0, lua_gettop(L));
}

TEST_F(PreloadTest, SchemasAreNoModules) {
    addEmbeddedFilesToPreload(L);
    EXPECT_EQ(0u, run("return require('definitions')").find("error: "));
    EXPECT_EQ("nil", run("return tostring(package.preload['definitions'])"));
}

TEST_F(PreloadTest, TheChunkNameIsTheFileName) {
    addEmbeddedFilesToPreload(L);
    EXPECT_EQ("json.lua", run("return debug.getinfo(require('json').decode, 'S').source"));
}

TEST_F(PreloadTest, ABadFileIsReportedAndTheOthersAreInstalled) {
    static const EmbeddedFile files[] = {
        {"first.lua", "return 1", 8}, {"bad.lua", "return +", 8},  {"noextension", "return +", 8},
        {"notes.txt", "return +", 8}, {"a.b.luac", "return 2", 8}, {"last.lua", "return 3", 8},
    };
    testing::internal::CaptureStderr();
    EXPECT_EQ(1, addFilesToPreload(L, {files, files + 6}));
    EXPECT_EQ(
        "ERROR: Failed to load \"bad.lua\": [string \"bad.lua\"]:1: unexpected symbol near "
        "'+'\n",
        testing::internal::GetCapturedStderr());
    EXPECT_EQ("1", run("return require('first')"));
    EXPECT_EQ("2", run("return require('a.b')"));
    EXPECT_EQ("3", run("return require('last')"));
    EXPECT_EQ("nil", run("return tostring(package.preload.bad)"));
    EXPECT_EQ("nil", run("return tostring(package.preload.noextension or package.preload.notes)"));
    EXPECT_EQ(0, lua_gettop(L));
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
    EXPECT_EQ("true", run("return tostring(json.decode(' true '))"));
    EXPECT_EQ("false", run("return tostring(json.decode('false'))"));
    EXPECT_EQ("nil", run("return tostring((json.decode('null')))"));
    EXPECT_EQ("-12.5", run("return json.decode('-12.5')"));
    EXPECT_EQ("1500", run("return json.decode('1.5e+3')"));
    EXPECT_EQ("0", run("return json.decode('0')"));
    EXPECT_EQ("text", run("return json.decode('\"text\"')"));
    EXPECT_EQ("3 2", run("local a = json.decode('[1, [2], 3]') return a[3] .. ' ' .. a[2][1]"));
    EXPECT_EQ("1 x", run("local o = json.decode('{\"a\": {\"b\": 1}, \"\": \"x\"}') "
                         "return o.a.b .. ' ' .. o['']"));
    EXPECT_EQ("nil",
              run("return tostring(next((json.decode('[ ]'))) or next((json.decode('{ }'))))"));
}

TEST_F(JsonModuleTest, AnswersWithThePositionBehindTheValue) {
    EXPECT_EQ("6", run("return (select(2, json.decode('[1]  x')))"));
    EXPECT_EQ("2", run("return (json.decode('1 2', 3))"));
}

TEST_F(JsonModuleTest, ANullLeavesItsPlaceEmpty) {
    EXPECT_EQ("nil 2", run("local a = json.decode('[null, 2]') "
                           "return tostring(a[1]) .. ' ' .. a[2]"));
    EXPECT_EQ("nil", run("return tostring(next((json.decode('{\"a\": null}'))))"));
}

TEST_F(JsonModuleTest, ResolvesEscapes) {
    EXPECT_EQ("\"\\/\b\f\n\r\t", run(R"(return json.decode([["\"\\\/\b\f\n\r\t"]]))"));
    EXPECT_EQ("A\xC3\xA9\xE2\x82\xAC\xF0\x9F\x98\x80",
              run(R"(return json.decode([["\u0041\u00E9\u20ac\ud83d\ude00"]]))"));
}

TEST_F(JsonModuleTest, RefusesWhatIsNoJson) {
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
            0u,
            run("return json.decode([==[\n" + std::string(text) + "]==])").find("error: json: "))
            << text;
    }
}

TEST_F(JsonModuleTest, DoesNotRunTheInput) {
    run("ran = false function touch() ran = true return 1 end");
    EXPECT_EQ(0u, run("return json.decode('touch()')").find("error: "));
    EXPECT_EQ(0u, run("return json.decode('[touch()]')").find("error: "));
    EXPECT_EQ("false", run("return tostring(ran)"));
}

TEST_F(JsonModuleTest, DeepNestingIsAnErrorAndNoCrash) {
    EXPECT_EQ("false", run("return tostring((pcall(json.decode, ('['):rep(1000000))))"));
}

TEST_F(JsonModuleTest, EncodesEachKindOfValue) {
    EXPECT_EQ("null", run("return json.encode(nil)"));
    EXPECT_EQ("null", run("return json.encode(json.null)"));
    EXPECT_EQ("true", run("return json.encode(true)"));
    EXPECT_EQ("-1.5", run("return json.encode(-1.5)"));
    EXPECT_EQ("4294967295", run("return json.encode(4294967295)"));
    EXPECT_EQ(R"("a\"\\\n\u0001\u007f)"
              "\xC3\xA9\"",
              run(R"(return json.encode('a"\\\n\1\127)"
                  "\xC3\xA9')"));
    EXPECT_EQ("[1,[\"x\"],null]", run("return json.encode({1, {'x'}, json.null})"));
    EXPECT_EQ("{\"a\":{\"b\":[]}}", run("return json.encode({a = {b = {}}})"));
    EXPECT_EQ(0u, run("return json.encode(0/0)").find("error: json: "));
    EXPECT_EQ(0u, run("return json.encode(math.huge)").find("error: json: "));
    EXPECT_EQ(0u, run("return json.encode(print)").find("error: json: "));
}

TEST_F(JsonModuleTest, WhatItEncodesItDecodes) {
    EXPECT_EQ("a\"b\\c\n", run("return json.decode(json.encode({x = {'a\"b\\\\c\\n'}})).x[1]"));
}

}  // namespace
