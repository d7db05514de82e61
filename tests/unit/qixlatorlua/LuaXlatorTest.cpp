#include "qixlatorlua/LuaXlator.h"

#include <gtest/gtest.h>

#include <lua.hpp>
#include <string>

#include "ScriptHost.h"
#include "support/FaultyAllocator.h"

namespace {

using qixlatorlua::LuaRuntime;

class LuaXlatorTest : public testing::TestWithParam<LuaRuntime> {
  protected:
    std::string describeJson(const std::string& json, const char* format, qierr_Status* failure) {
        XlatorInterface* xlator = host.create(host.registration("chunk"), failure);
        if (xlator == nullptr) {
            return "(no translator)";
        }
        const std::string text = ScriptHost::taken(xlator->getDynamicDesc(
            xlator, json.c_str(), 0x203, format, qixlator_realloc, nullptr, failure));
        xlator->destroy(xlator);
        return text;
    }

    // A translator whose getDynamicDesc(json, lang, ade, format) is this chunk.
    void writeDynamic(const std::string& chunk) {
        host.write("chunk", "return { getDynamicDesc = function(json, lang, ade, format)\n" +
                                chunk + "\nend }");
    }

    ScriptHost host{GetParam()};
    qierr::Status status;
};

INSTANTIATE_TEST_SUITE_P(Runtimes, LuaXlatorTest,
                         testing::Values(LuaRuntime::Plain, LuaRuntime::Fast),
                         [](const testing::TestParamInfo<LuaRuntime>& runtime) {
                             return runtime.param == LuaRuntime::Plain ? "Plain" : "Fast";
                         });

TEST_P(LuaXlatorTest, TheScriptGetsCodeLanguageAndEnvironment) {
    EXPECT_EQ(host.run("return code .. ' ' .. lang .. ' ' .. ade", &status), "-1 3 2");
    writeDynamic("return json .. ' ' .. lang .. ' ' .. ade .. ' ' .. format");
    EXPECT_EQ(describeJson("{\"a\":1}", "json1", &status), "{\"a\":1} 3 2 json1");
    EXPECT_EQ(status.code, 0);
}

TEST_P(LuaXlatorTest, LanguageAndEnvironmentAreEightAndFourBitsOfTheAttributes) {
    host.write("chunk",
               "return { getStaticDesc = function(code, lang, ade)\n"
               "return lang .. ' ' .. ade end }");
    XlatorInterface* xlator = host.create(host.registration("chunk"), &status);
    ASSERT_NE(xlator, nullptr);
    const auto seen = [&](std::uint32_t attributes) {
        return ScriptHost::taken(
            xlator->getStaticDesc(xlator, -1, attributes, qixlator_realloc, nullptr, &status));
    };
    EXPECT_EQ(seen(0xF00), "0 15");
    EXPECT_EQ(seen(0xFF), "255 0");
    EXPECT_EQ(seen(0xFFFFF203), "3 2");
    EXPECT_EQ(seen(0xFFFFF000), "0 0");
    xlator->destroy(xlator);
}

TEST_P(LuaXlatorTest, TheStructureSizeIsSixteenWhateverThePlatform) {
    writeDynamic("");
    XlatorInterface* xlator = host.create(host.registration("chunk"), &status);
    ASSERT_NE(xlator, nullptr);
    EXPECT_EQ(xlator->structSize, 16u);
    xlator->destroy(xlator);
}

TEST_P(LuaXlatorTest, TheScriptKnowsItsNameAndSettings) {
    EXPECT_EQ(host.run("return qixlatorlua_name .. ' ' .. "
                       "type(qixlatorlua_settings)",
                       &status),
              "test_name table");
    host.write("chunk",
               "return { getStaticDesc = function() return "
               "qixlatorlua_settings.a .. qixlatorlua_settings.b end }");
    XlatorInterface* xlator = host.create(
        "{\"qixlatorlua_xlator\":\"chunk\",\"qixlatorlua_settings\":{\"a\":\"x\","
        "\"b\":\"y\"},\"qixlatorlua_path\":\"/nowhere;" +
            host.root.locate("\\\\scripts/") + "\"}",
        &status);
    ASSERT_NE(xlator, nullptr) << status.json;
    EXPECT_EQ(
        ScriptHost::taken(xlator->getStaticDesc(xlator, -1, 0, qixlator_realloc, nullptr, &status)),
        "xy");
    xlator->destroy(xlator);
}

TEST_P(LuaXlatorTest, WithoutAPathOnlyEmbeddedModulesAreFound) {
    EXPECT_EQ(host.create("{\"qixlatorlua_xlator\":\"chunk\"}", &status), nullptr);
    EXPECT_EQ(status.code, -52003);
    qierr::Status second;
    XlatorInterface* xlator = host.create("{\"qixlatorlua_xlator\":\"qimxl_utilities\"}", &second);
    ASSERT_NE(xlator, nullptr);
    xlator->destroy(xlator);
}

TEST_P(LuaXlatorTest, AnUnusableRegistrationTextIsReported) {
    for (const char* text : {"{}", "", "5", "{\"qixlatorlua_xlator\":\"missing\"}", "os.exit(1)"}) {
        qierr::Status failure;
        EXPECT_EQ(host.create(text, &failure), nullptr) << text;
        EXPECT_EQ(failure.code, -52003) << text;
        EXPECT_TRUE(
            reported(failure, "\"error_constant\":\"qiapalerr_softwareFaultAPALInternalUseOnly\""));
        EXPECT_TRUE(
            reported(failure, "\"internal_error\":{\"api\":\"lua\",\"code\":2,\"string\":\""))
            << failure.json;
        EXPECT_TRUE(reported(failure,
                             "\"qixlatorlua_debug\":{\"debug\":\"lua setupEnv failed\","
                             "\"name\":\"test_name\",\"registrationInfo\":\""))
            << failure.json;
    }
}

TEST_P(LuaXlatorTest, NothingIsDoneWhenTheStatusIsNegative) {
    writeDynamic("return 'text'");
    qierr::Status creation;
    XlatorInterface* xlator = host.create(host.registration("chunk"), &creation);
    status.code = -1;
    EXPECT_EQ(host.create(host.registration("chunk"), &status), nullptr);
    EXPECT_EQ(xlator->getDynamicDesc(xlator, "{}", 0, "json1", qixlator_realloc, nullptr, &status),
              nullptr);
    EXPECT_EQ(status.code, -1);
    xlator->destroy(xlator);
}

TEST_P(LuaXlatorTest, AnErrorOfTheScriptIsReportedWithATraceback) {
    EXPECT_EQ(host.run("error('oops')", &status), "(null)");
    EXPECT_EQ(status.code, -52003);
    EXPECT_TRUE(reported(status, "chunk.lua:2: oops\\nstack traceback:\\n")) << status.json;
    EXPECT_TRUE(reported(status, "\"qixlatorlua_debug\":{\"debug\":\"failed to get static desc\"}"))
        << status.json;
}

TEST_P(LuaXlatorTest, AnErrorOfTheDynamicDescriptionIsReported) {
    writeDynamic("return json.x.y");
    EXPECT_EQ(describeJson("{}", "json1", &status), "(null)");
    EXPECT_EQ(status.code, -52003);
    EXPECT_TRUE(reported(status, "\"internal_error\":{\"api\":\"lua\",\"code\":2,\"string\":\""));
    EXPECT_TRUE(
        reported(status, "\"qixlatorlua_debug\":{\"debug\":\"failed to get dynamic desc\"}"))
        << status.json;
}

TEST_P(LuaXlatorTest, AFailureOfANativeFunctionCarriesItsStatusText) {
    host.run("require('qixlatorluautils').convertLangToDir(6)", &status);
    EXPECT_TRUE(reported(status,
                         "\"string\":\"{\\\"error_constant\\\":"
                         "\\\"qiapalerr_invalidParameter\\\""))
        << status.json;
    EXPECT_TRUE(reported(status, "}}\\nstack traceback:\\n")) << status.json;
}

TEST_P(LuaXlatorTest, AnErrorThatIsNotATextIsAFailureToo) {
    EXPECT_EQ(host.run("error({})", &status), "(null)");
    EXPECT_EQ(status.code, -52003);
    host.write("chunk", "error({})");
    qierr::Status second;
    EXPECT_EQ(host.create(host.registration("chunk"), &second), nullptr);
    EXPECT_EQ(second.code, -52003);
    EXPECT_TRUE(reported(second, "\"internal_error\":{\"api\":\"lua\",\"code\":2,\"string\":\"\"}"))
        << second.json;
}

TEST_P(LuaXlatorTest, WithoutAHandlerTheMessageHasNoTraceback) {
    host.write("chunk",
               "qixlatorlua_errHandler = nil\n"
               "return { getStaticDesc = function() error('oops', 0) end }");
    XlatorInterface* xlator = host.create(host.registration("chunk"), &status);
    ASSERT_NE(xlator, nullptr);
    EXPECT_EQ(xlator->getStaticDesc(xlator, -1, 0, qixlator_realloc, nullptr, &status), nullptr);
    EXPECT_TRUE(reported(status, "\"string\":\"oops\"}")) << status.json;
    xlator->destroy(xlator);
}

TEST_P(LuaXlatorTest, AMissingFunctionIsReported) {
    host.write("chunk", "return {}");
    EXPECT_EQ(describeJson("{}", "json1", &status), "(null)");
    EXPECT_EQ(status.code, -52003);
}

TEST_P(LuaXlatorTest, ManyFailuresDoNotExhaustTheState) {
    host.write("chunk",
               "return { getStaticDesc = function(code) if code == 0 then return 'good' "
               "end error('oops') end }");
    XlatorInterface* xlator = host.create(host.registration("chunk"), &status);
    ASSERT_NE(xlator, nullptr);
    for (int count = 0; count < 10000; ++count) {
        qierr::Status failure;
        xlator->getStaticDesc(xlator, -1, 0, qixlator_realloc, nullptr, &failure);
        ASSERT_EQ(failure.code, -52003);
    }
    EXPECT_EQ(
        ScriptHost::taken(xlator->getStaticDesc(xlator, 0, 0, qixlator_realloc, nullptr, &status)),
        "good");
    xlator->destroy(xlator);
}

TEST_P(LuaXlatorTest, AFailedCallLeavesTheStackAsItWas) {
    host.write("chunk",
               "local function fail() error('oops') end\n"
               "return { getStaticDesc = fail, getDynamicDesc = fail }");
    XlatorInterface* xlator = host.create(host.registration("chunk"), &status);
    ASSERT_NE(xlator, nullptr);
    lua_State* L = static_cast<qixlatorlua::LuaXlator*>(xlator)->L;
    const int before = lua_gettop(L);
    qierr::Status ofStatic;
    xlator->getStaticDesc(xlator, -1, 0, qixlator_realloc, nullptr, &ofStatic);
    EXPECT_EQ(ofStatic.code, -52003);
    EXPECT_EQ(lua_gettop(L), before);
    qierr::Status ofDynamic;
    xlator->getDynamicDesc(xlator, "{}", 0, "json1", qixlator_realloc, nullptr, &ofDynamic);
    EXPECT_EQ(ofDynamic.code, -52003);
    EXPECT_EQ(lua_gettop(L), before);
    xlator->destroy(xlator);
}

TEST_P(LuaXlatorTest, TheGarbageOfManyCallsIsCollected) {
    host.write("chunk",
               "return { getStaticDesc = function(code) "
               "return tostring(('x'):rep(100000) .. code):sub(1, 1) end }");
    XlatorInterface* xlator = host.create(host.registration("chunk"), &status);
    ASSERT_NE(xlator, nullptr);
    FaultyAllocator::succeed();
    const std::int64_t before = FaultyAllocator::liveBytes();
    for (int count = 0; count < 1000; ++count) {
        ScriptHost::taken(
            xlator->getStaticDesc(xlator, count, 0, qixlator_realloc, nullptr, &status));
    }
    // The calls have allocated two hundred million bytes.
    EXPECT_GT(20000000, FaultyAllocator::peakBytes() - before);
    xlator->destroy(xlator);
}

TEST_P(LuaXlatorTest, ANumberOfTheDynamicDescriptionIsAStatusCode) {
    writeDynamic("return -52029");
    EXPECT_EQ(describeJson("{}", "json1", &status), "(null)");
    EXPECT_EQ(status.code, -52029);
    EXPECT_TRUE(reported(status, "\"error_constant\":\"(int32_t)lua_tointeger(L, -1)\""))
        << status.json;
    EXPECT_TRUE(
        reported(status, "\"qixlatorlua_debug\":{\"debug\":\"failed to get dynamic desc\"}"))
        << status.json;
}

TEST_P(LuaXlatorTest, ZeroIsNeitherTextNorFailure) {
    writeDynamic("return 0");
    EXPECT_EQ(describeJson("{}", "json1", &status), "(null)");
    EXPECT_EQ(status.code, 0);
}

TEST_P(LuaXlatorTest, ATextOfDigitsIsAText) {
    writeDynamic("return '-5'");
    EXPECT_EQ(describeJson("{}", "json1", &status), "-5");
    EXPECT_EQ(status.code, 0);
}

TEST_P(LuaXlatorTest, ANumberOfTheStaticDescriptionIsAText) {
    EXPECT_EQ(host.run("return -5", &status), "-5");
    EXPECT_EQ(host.run("return nil", &status), "(null)");
    EXPECT_EQ(status.code, 0);
}

TEST_P(LuaXlatorTest, TheCallersAllocationIsUsed) {
    static int sizes[2];
    static int calls;
    calls = 0;
    const auto alloc = [](void* pointer, std::uint32_t size, void* context, qierr_Status* status) {
        EXPECT_EQ(context, &calls);
        sizes[calls++] = static_cast<int>(size);
        return qixlator_realloc(pointer, size, nullptr, status);
    };
    host.write("chunk", "return { getStaticDesc = function() return 'text' end }");
    XlatorInterface* xlator = host.create(host.registration("chunk"), &status);
    ASSERT_NE(xlator, nullptr);
    char* text = xlator->getStaticDesc(xlator, -1, 0, alloc, &calls, &status);
    EXPECT_STREQ(text, "text");
    alloc(text, 0, &calls, &status);
    EXPECT_EQ(sizes[0], 5);
    EXPECT_EQ(calls, 2);
    xlator->destroy(xlator);
}

TEST_P(LuaXlatorTest, DestroyingFreesAllMemory) {
    host.run("return 'warm'", &status);
    const std::int64_t before = FaultyAllocator::liveBlocks();
    host.run("local t = {} for i = 1, 1000 do t[i] = ('x'):rep(i) end keep = t return 'x'",
             &status);
    EXPECT_EQ(FaultyAllocator::liveBlocks(), before);
}

}  // namespace
