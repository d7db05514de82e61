#include "qixlatorlua/PreparedStates.h"

#include <gtest/gtest.h>

#include <chrono>
#include <filesystem>
#include <lua.hpp>
#include <string>
#include <thread>
#include <utility>
#include <vector>

#include "StatusTexts.h"
#include "qisysq/FileLooks.h"
#include "qixlator/Registration.h"
#include "qixlator/qixlator.h"
#include "qixlatorlua/LuaXlator.h"
#include "support/TestRoot.h"
#include "unit/qixlatorlua/ScriptHost.h"

namespace {

using qixlatorlua::LuaRuntime;
using qixlatorlua::PreparedStates;
using statusTexts::usage;
using statusTexts::withEntries;

constexpr const char* name = "mxlator_qitrmc";

XlatorInterface* createAs(LuaRuntime runtime, const char* registrationInfo) {
    qierr::Status status;
    XlatorInterface* xlator =
        qixlatorlua::createLuaXlator(name, registrationInfo, runtime, &status);
    EXPECT_NE(xlator, nullptr) << (status.json == nullptr ? "" : status.json);
    return xlator;
}

XlatorInterface* create() {
    return createAs(LuaRuntime::Prepared,
                    qixlator::localRegistrations().find(name)->registrationInfo);
}

lua_State* stateOf(XlatorInterface* xlator) {
    return static_cast<qixlatorlua::LuaXlator*>(xlator)->L;
}

// The text that a chunk returns in the state of a translator, where it is loaded as scripts load
// code.
std::string run(XlatorInterface* xlator, const char* chunk) {
    lua_State* L = stateOf(xlator);
    lua_getglobal(L, "loadstring");
    lua_pushstring(L, chunk);
    lua_call(L, 1, 1);
    const bool failed = lua_pcall(L, 0, 1, 0) != 0;
    const char* text = lua_tostring(L, -1);
    const std::string result =
        (failed ? "failed: " : "") + std::string(text == nullptr ? "" : text);
    lua_settop(L, 0);
    return result;
}

// Everything that a script can reach in its state, with the order of all tables: each object is
// described once, by what it contains, and later by its number.
constexpr const char* describeAll = R"(
    local lines, numbers, count = {}, {}, 0
    local queue = {}
    local function id(value)
        local kind = type(value)
        if kind == "string" then return string.format("%q", value) end
        if kind == "number" or kind == "boolean" or kind == "nil" then return tostring(value) end
        if not numbers[value] then
            count = count + 1
            numbers[value] = count
            queue[count] = value
        end
        return kind .. numbers[value]
    end
    local function add(...) lines[#lines + 1] = table.concat({ ... }, " ") end
    local registry = debug.getregistry()
    add(id(registry), id(_G), id(debug.getmetatable("")), id(debug.getmetatable(nil)),
        id(debug.getmetatable(1)), id(debug.getmetatable(true)), id(debug.getmetatable(print)),
        id(debug.getfenv(coroutine.running() or print)), id(debug.gethook()))
    local done = 0
    while done < count do
        done = done + 1
        local value = queue[done]
        add("object", tostring(done), type(value), id(debug.getmetatable(value)))
        if type(value) == "table" then
            local key, content = next(value)
            while key ~= nil do
                if value ~= numbers and value ~= queue and value ~= lines then
                    add(id(key), id(content))
                end
                key, content = next(value, key)
            end
        elseif type(value) == "function" then
            local info = debug.getinfo(value, "Su")
            add(info.what, info.source, tostring(info.linedefined), id(debug.getfenv(value)))
            for index = 1, info.nups do
                if value ~= id and value ~= add then
                    local upvalue, content = debug.getupvalue(value, index)
                    add(tostring(upvalue), id(content))
                end
            end
        elseif type(value) == "userdata" then
            add(id(debug.getfenv(value)))
        end
    end
    return table.concat(lines, "\n"))";

class PreparedStatesTest : public testing::Test {
  protected:
    PreparedStatesTest() { PreparedStates::ofProcess().clear(); }
    ~PreparedStatesTest() override { PreparedStates::ofProcess().clear(); }

    // Runs a chunk in a translator of its own.
    static std::string runOnce(const char* chunk) {
        XlatorInterface* xlator = create();
        const std::string result = run(xlator, chunk);
        xlator->destroy(xlator);
        return result;
    }

    TestRoot root;
};

TEST_F(PreparedStatesTest, AStateIsUsedAgain) {
    XlatorInterface* first = create();
    lua_State* const L = stateOf(first);
    first->destroy(first);
    XlatorInterface* second = create();
    EXPECT_EQ(stateOf(second), L);
    second->destroy(second);
}

TEST_F(PreparedStatesTest, NoScriptLeavesATraceForTheNextTranslation) {
    const std::string fresh = runOnce(describeAll);
    ASSERT_GT(fresh.size(), 40000u) << fresh;
    const std::string memory = runOnce("return collectgarbage('count')");
    for (const char* chunk : {
             "x = 1",
             "string.format = nil",
             "string.added = function() end",
             "getmetatable('').__index = function() return 'x' end",
             "debug.setmetatable(nil, { __index = function() return 1 end })",
             "debug.setmetatable(1, { __call = print })",
             "debug.getregistry().x = 1",
             "debug.getregistry()[1] = {}",
             "debug.getregistry()['FILE*'] = nil",
             "package.loaded.x = 1",
             "package.loaded.mxlator = nil",
             "package.preload.x = print",
             "package.path = '/tmp/?.lua'",
             "table.remove(package.loaders)",
             "require('commonTerms_deu')",
             "require('util')",
             "qixlatorlua_settings.driverName = 'x'",
             "qixlatorlua_xlator.getStaticDesc = nil",
             "local _, terms = debug.getupvalue(usageTypes_eng.getString, 1) terms.x = 'x'",
             "local _, terms = debug.getupvalue(usageTypes_eng.getString, 1) "
             "terms.kUsageTypeName = 'x'",
             "for key in pairs(_G) do _G[key] = nil end",
             "setfenv(0, {})",
             "debug.sethook(function() end, 'c')",
             "setmetatable(_G, { __newindex = error })",
             "collectgarbage()",
             "collectgarbage('restart')",
             "for key in pairs(debug.getregistry()) do debug.getregistry()[key] = nil end "
             "collectgarbage()",
             "for _, value in pairs(debug.getregistry()) do local methods = "
             "debug.getmetatable(value) if methods then methods.__gc = nil end end",
             "local all = {} for i = 1, 20000 do all[i] = 'text ' .. i end",
             "local text = string.rep('x', 3000000) require('cjson').encode(text)",
             "require('cjson').encode_keep_buffer(false)",
             "require('cjson').encode_max_depth(1)",
             "require('cjson').decode('{\"a\":[1,2,3]}')",
             "coroutine.wrap(function() coroutine.yield() end)()",
             "io.output(io.tmpfile())",
             "io.tmpfile():write('x')",
             "getmetatable(newproxy(true)).__gc = function() error('x') end",
             "local proxy = newproxy(true) getmetatable(proxy).__gc = function() "
             "local all = {} for i = 1, 1000 do all[i] = { i } end end",
             "local function f() return f() + 1 end return f()",
             "error({})",
         }) {
        runOnce(chunk);
        EXPECT_EQ(runOnce(describeAll), fresh) << "after " << chunk;
        EXPECT_EQ(runOnce("return collectgarbage('count')"), memory) << "after " << chunk;
    }
}

// Only through the functions of a translator, as the service does.
void translateOnce(const std::string& json, std::uint32_t attributes) {
    XlatorInterface* xlator = create();
    qierr::Status status;
    ScriptHost::taken(
        xlator->getStaticDesc(xlator, -250833, attributes, qixlator_realloc, nullptr, &status));
    ScriptHost::taken(xlator->getDynamicDesc(xlator, json.c_str(), attributes, "json1",
                                             qixlator_realloc, nullptr, &status));
    xlator->destroy(xlator);
}

TEST_F(PreparedStatesTest, NoTranslationLeavesATraceForTheNext) {
    const std::string fresh = runOnce(describeAll);
    const std::string memory = runOnce("return collectgarbage('count')");
    std::vector<std::string> texts = statusTexts::ofEveryKind();
    // More strings than the state has room for in its table of strings.
    std::string many = "\"0\"";
    for (int number = 1; number < 10000; ++number) {
        many += ",\"value " + std::to_string(number) + "\"";
    }
    texts.insert(texts.begin() + 3, withEntries(usage("kUsageTypeName", "[" + many + "]", "1")));
    for (const std::uint32_t language : {0u, 2u, 9u}) {
        for (const std::string& json : texts) {
            translateOnce(json, language | 0x200);
            translateOnce(json, language);
            EXPECT_EQ(runOnce(describeAll), fresh) << "after " << json;
            EXPECT_EQ(runOnce("return collectgarbage('count')"), memory) << "after " << json;
        }
    }
}

// The details of a status as a translator of its own gives them.
std::string detailsOnce(const std::string& json) {
    XlatorInterface* xlator = create();
    qierr::Status status;
    const std::string text = ScriptHost::taken(xlator->getDynamicDesc(
        xlator, json.c_str(), 0x200, "json1", qixlator_realloc, nullptr, &status));
    xlator->destroy(xlator);
    return text;
}

// What the first use leaves unchanged says what need not be written back, if it does all that a
// translation does.
TEST_F(PreparedStatesTest, AFirstUseThatDoesLessLeavesNoTrace) {
    const std::string json = withEntries(usage("kUsageTypeName", "\"text\"", "1"));
    const std::string fresh = runOnce(describeAll);
    const std::string expected = detailsOnce(json);
    const auto describeCode = [](XlatorInterface* xlator) {
        qierr::Status status;
        ScriptHost::taken(
            xlator->getStaticDesc(xlator, -250833, 0x200, qixlator_realloc, nullptr, &status));
    };
    for (const bool describesCode : {false, true}) {
        PreparedStates::ofProcess().clear();
        XlatorInterface* xlator = create();
        if (describesCode) {
            describeCode(xlator);
        }
        xlator->destroy(xlator);
        for (int round = 0; round < 3; ++round) {
            EXPECT_EQ(detailsOnce(json), expected);
            translateOnce(json, 0x200);
        }
        EXPECT_EQ(runOnce(describeAll), fresh);
    }
}

std::string explanation(const std::string& text) {
    return "<?xml version=\"1.0\"?>\n<qidocument>\n<qierror code=\"-1\">\n" + text +
           "\n</qierror>\n</qidocument>\n";
}

// The description of code -1 as a failure of a request gets it, and whether it was kept before.
std::pair<std::string, bool> description() {
    const qisysq::FileLooks looks;
    XlatorInterface* xlator = create();
    const qixlatorlua::KeptTexts* texts = PreparedStates::ofProcess().textsOf(stateOf(xlator));
    const bool wasKept = texts != nullptr && texts->find(-1, 0x200) != nullptr;
    qierr::Status status;
    const std::string text = ScriptHost::taken(
        xlator->getStaticDesc(xlator, -1, 0x200, qixlator_realloc, nullptr, &status));
    xlator->destroy(xlator);
    return {text, wasKept};
}

// Texts are kept as soon as nothing that they depend on was changed in the last seconds. The pauses
// leave the processor to other tests.
void describeUntilKept(const std::string& expected) {
    const auto end = std::chrono::steady_clock::now() + std::chrono::seconds(30);
    for (bool isKept = false; !isKept;) {
        const auto [text, wasKept] = description();
        ASSERT_EQ(text, expected);
        ASSERT_LT(std::chrono::steady_clock::now(), end);
        isKept = wasKept;
        std::this_thread::sleep_for(std::chrono::milliseconds(20));
    }
}

TEST_F(PreparedStatesTest, EachChangeOfAFileShowsInTheNextDescription) {
    const std::string ofDriver = "/usr/local/qinstal/share/mierrors/qitrmc/English/";
    root.write(ofDriver + "a.txt", explanation("Old."));
    describeUntilKept("Old.");
    root.write(ofDriver + "a.txt", explanation("New."));
    EXPECT_EQ(description().first, "New.");
    std::filesystem::remove(root.locate(ofDriver + "a.txt"));
    EXPECT_EQ(description().first, "Error description not found");
    root.write(ofDriver + "b.txt", explanation("Added."));
    describeUntilKept("Added.");
    root.write("/other/mierrors/qitrmc/English/a.txt", explanation("Elsewhere."));
    root.write("/etc/qinstal/share/share.dir", root.locate("/other"));
    EXPECT_EQ(description().first, "Elsewhere.");
}

TEST_F(PreparedStatesTest, ADescriptionByChangedScriptsIsNotKept) {
    root.write("/usr/local/qinstal/share/mierrors/qitrmc/English/a.txt", explanation("Found."));
    describeUntilKept("Found.");
    const qisysq::FileLooks looks;
    for (int round = 0; round < 2; ++round) {
        XlatorInterface* xlator = create();
        run(xlator, "qixlatorlua_xlator.getStaticDesc = function() return 'changed' end");
        qierr::Status status;
        EXPECT_EQ(ScriptHost::taken(
                      xlator->getStaticDesc(xlator, -1, 0x200, qixlator_realloc, nullptr, &status)),
                  "changed");
        xlator->destroy(xlator);
    }
    EXPECT_EQ(description().first, "Found.");
}

TEST_F(PreparedStatesTest, AStateThatIsUsedAgainIsLikeOneThatWasSetUp) {
    const char* registrationInfo = qixlator::localRegistrations().find(name)->registrationInfo;
    XlatorInterface* xlator = createAs(LuaRuntime::Fast, registrationInfo);
    run(xlator,
        "require('commonTerms_eng') require('qimxl_defaultAttrTable') "
        "for name in pairs(package.preload) do package.preload[name] = nil end");
    const std::string expected = run(xlator, describeAll);
    xlator->destroy(xlator);
    runOnce("return 1");
    EXPECT_EQ(runOnce(describeAll), expected);
}

TEST_F(PreparedStatesTest, TranslatorsAtTheSameTimeHaveDifferentStates) {
    std::vector<XlatorInterface*> xlators;
    for (int count = 0; count < 5; ++count) {
        xlators.push_back(create());
        EXPECT_EQ(run(xlators.back(), "mine = (mine or 0) + 1 return mine"), "1");
    }
    for (XlatorInterface* xlator : xlators) {
        EXPECT_EQ(run(xlator, "mine = mine + 1 return mine"), "2");
        xlator->destroy(xlator);
    }
    EXPECT_EQ(runOnce("return tostring(mine)"), "nil");
}

TEST_F(PreparedStatesTest, ATranslatorWithAnotherRegistrationHasItsOwnState) {
    runOnce("x = 1");
    XlatorInterface* other =
        createAs(LuaRuntime::Prepared,
                 R"({"qixlatorlua_xlator":"mxlator","qixlatorlua_settings":{"driverName":"o"}})");
    EXPECT_EQ(run(other, "return qixlatorlua_settings.driverName"), "o");
    other->destroy(other);
    EXPECT_EQ(runOnce("return qixlatorlua_settings.driverName"), "qitrmc");
}

TEST_F(PreparedStatesTest, ScriptsOfADirectoryAreLoadedForEachTranslation) {
    const std::string registration =
        R"({"qixlatorlua_xlator":"mine","qixlatorlua_path":")" + root.locate("/scripts") + "\"}";
    for (const char* text : {"one", "two"}) {
        root.write("/scripts/mine.lua", "text = '" + std::string(text) + "' return {}");
        XlatorInterface* xlator = createAs(LuaRuntime::Prepared, registration.c_str());
        EXPECT_EQ(run(xlator, "return text"), text);
        xlator->destroy(xlator);
    }
    EXPECT_EQ(PreparedStates::ofProcess().size(), 0u);
}

TEST_F(PreparedStatesTest, WhatIsKeptIsLimited) {
    std::vector<XlatorInterface*> xlators;
    for (int count = 0; count < 5; ++count) {
        xlators.push_back(create());
    }
    for (XlatorInterface* xlator : xlators) {
        run(xlator, "all = {} for i = 1, 100000 do all[i] = { i } end");
        xlator->destroy(xlator);
    }
    EXPECT_GT(PreparedStates::ofProcess().size(), 2u * 128 * 1024);
    // Leaves room for the bytecode of the English scripts and for the results of searches.
    EXPECT_LE(PreparedStates::ofProcess().size(), 900u * 1024);
}

// Appends a text to a file when the userdata that it defines is finalized.
std::string finalizerThatWrites(const std::string& path, const char* text, const char* then) {
    return "getmetatable(newproxy(true)).__gc = function() local file = io.open('" + path +
           "', 'a') file:write('" + text + "') file:close() " + then + " end\n";
}

TEST_F(PreparedStatesTest, TheFinalizersOfAScriptRunFromTheNewestUserdataToTheOldest) {
    const char* registrationInfo = qixlator::localRegistrations().find(name)->registrationInfo;
    const std::string path = root.locate("/finalized");
    const std::string script = finalizerThatWrites(path, "oldest. ", "") +
                               finalizerThatWrites(path, "middle, ", "error('x')") +
                               finalizerThatWrites(path, "newest, ", "string.rep('x', 100000)");
    const std::string read = "return io.open('" + path + "'):read('*a')";
    // What a script removes from the registry is needed to run only the finalizers.
    const std::string remove =
        "for key in pairs(debug.getregistry()) do if type(key) == 'userdata' then "
        "debug.getregistry()[key] = nil end end collectgarbage()\n";
    for (const LuaRuntime runtime : {LuaRuntime::Plain, LuaRuntime::Fast, LuaRuntime::Prepared}) {
        for (const std::string& before : {std::string(), remove}) {
            runOnce(("os.remove('" + path + "')").c_str());
            XlatorInterface* xlator = createAs(runtime, registrationInfo);
            EXPECT_EQ(run(xlator, (before + script).c_str()), "");
            xlator->destroy(xlator);
            EXPECT_EQ(runOnce(read.c_str()), "newest, middle, oldest. ");
        }
    }
}

TEST_F(PreparedStatesTest, FilesThatAScriptLeavesOpenAreClosed) {
    XlatorInterface* xlator = create();
    const std::string path = root.locate("/left-open");
    run(xlator, ("io.open('" + path + "', 'w'):write('text')").c_str());
    xlator->destroy(xlator);
    EXPECT_EQ(runOnce(("return io.open('" + path + "'):read('*a')").c_str()), "text");
}

}  // namespace
