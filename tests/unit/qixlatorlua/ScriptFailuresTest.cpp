#include <gtest/gtest.h>

#include <lua.hpp>
#include <regex>
#include <string>

#include "ScriptHost.h"
#include "support/FaultyAllocator.h"

namespace {

using qixlatorlua::LuaRuntime;

// Every failure in a script is reported as one status, and the state is closed.
class ScriptFailuresTest : public testing::TestWithParam<LuaRuntime> {
  protected:
    ScriptFailuresTest() {
        qierr::Status first;
        host.run("return 'warm'", &first);  // what is made once in the process is made now
        blocks = FaultyAllocator::liveBlocks();
    }
    ~ScriptFailuresTest() override {
        FaultyAllocator::succeed();
        EXPECT_EQ(FaultyAllocator::liveBlocks(), blocks);
    }

    // Expects a status that reports a failure of the interpreter. All of its text is compared
    // except the position; the message is matched.
    static void expectReport(const qierr_Status& status, const std::string& message,
                             const std::string& debug, int code = LUA_ERRRUN) {
        ASSERT_EQ(status.code, -52003);
        ASSERT_NE(status.json, nullptr);
        const std::string head =
            "{\"error_constant\":\"qiapalerr_softwareFaultAPALInternalUseOnly\","
            "\"file\":\"src/qixlatorlua/LuaState.cpp\",\"line\":#,\"component\":\"qitrmcsvc\","
            "\"internal_error\":{\"api\":\"lua\",\"code\":" +
            std::to_string(code) + ",\"string\":\"";
        const std::string tail = "\"},\"qixlatorlua_debug\":{\"debug\":\"" + debug + "}}";
        const std::string text =
            std::regex_replace(status.json, std::regex("\"line\":[0-9]+"), "\"line\":#",
                               std::regex_constants::format_first_only);
        ASSERT_LE(head.size() + tail.size(), text.size()) << text;
        EXPECT_EQ(text.substr(0, head.size()), head);
        EXPECT_EQ(text.substr(text.size() - tail.size()), tail);
        const std::string seen = text.substr(head.size(), text.size() - head.size() - tail.size());
        EXPECT_TRUE(std::regex_match(seen, std::regex(message))) << seen;
    }

    // The chunk is the body of the description of a code.
    void expectFailure(const std::string& chunk, const std::string& message) {
        qierr::Status status;
        EXPECT_EQ(host.run(chunk, &status), "(null)");
        expectReport(status, message, "failed to get static desc\"");
    }

    // `registration` is the registration text; `quoted` is the same inside a JSON string.
    void expectNoTranslator(const std::string& registration, const std::string& quoted,
                            const std::string& message, int code = LUA_ERRRUN) {
        qierr::Status status;
        EXPECT_EQ(host.create(registration, &status), nullptr) << registration;
        expectReport(
            status, message,
            "lua setupEnv failed\",\"name\":\"test_name\",\"registrationInfo\":\"" + quoted + "\"",
            code);
    }

    // The same for a registration text that names the module "chunk", which has this script.
    void expectNoModule(const std::string& script, const std::string& message,
                        int code = LUA_ERRRUN) {
        host.write("chunk", script);
        const std::string registration = host.registration("chunk");
        expectNoTranslator(registration, std::regex_replace(registration, std::regex("\""), "\\\""),
                           message, code);
    }

    ScriptHost host{GetParam()};
    std::int64_t blocks = 0;
};

INSTANTIATE_TEST_SUITE_P(Runtimes, ScriptFailuresTest,
                         testing::Values(LuaRuntime::Plain, LuaRuntime::Fast),
                         [](const testing::TestParamInfo<LuaRuntime>& runtime) {
                             return runtime.param == LuaRuntime::Plain ? "Plain" : "Fast";
                         });

const std::string traceback = "\\\\nstack traceback:\\\\n.*";

TEST_P(ScriptFailuresTest, ATextIsReportedWithATraceback) {
    expectFailure("error('oops', 0)", "oops" + traceback);
}

TEST_P(ScriptFailuresTest, ANumberIsReportedAsAText) {
    expectFailure("error(5.5, 0)", "5\\.5" + traceback);
    expectNoModule("error(5.5, 0)", "5\\.5");
}

TEST_P(ScriptFailuresTest, OtherValuesAreReportedWithTheFailureOfTheHandler) {
    for (const auto& [value, kind] : {std::pair("nil", "nil"), std::pair("{}", "table"),
                                      std::pair("true", "boolean"), std::pair("print", "function"),
                                      std::pair("coroutine.create(function() end)", "thread")}) {
        expectFailure(std::string("error(") + value + ", 0)",
                      std::string(".*attempt to concatenate local 'errorIn' \\(a ") + kind +
                          " value\\)" + traceback);
    }
}

TEST_P(ScriptFailuresTest, OtherValuesOfASetUpAreReportedWithoutAMessage) {
    for (const char* value : {"nil", "{}", "true", "print"}) {
        expectNoModule(std::string("error(") + value + ", 0)", "");
    }
}

TEST_P(ScriptFailuresTest, AMissingModuleIsReported) {
    expectFailure("require('missing')", ".*module 'missing' not found:.*" + traceback);
}

TEST_P(ScriptFailuresTest, AModuleThatCannotBeCompiledIsReported) {
    expectNoModule("return {", "error loading module 'chunk' from file '.*/scripts/chunk.lua':.*");
}

TEST_P(ScriptFailuresTest, EndlessRecursionIsReported) {
    expectFailure("local function f() return 1 + f() end return f()",
                  ".*stack overflow.*" + traceback);
}

TEST_P(ScriptFailuresTest, AHandlerThatFailsIsReported) {
    expectFailure("qixlatorlua_errHandler('x') error('oops')", ".*oops" + traceback);
    host.write("chunk",
               "function qixlatorlua_errHandler() error('again') end\n"
               "return { getStaticDesc = function() error('oops') end }");
    qierr::Status status;
    XlatorInterface* xlator = host.create(host.registration("chunk"), &status);
    ASSERT_NE(xlator, nullptr);
    EXPECT_EQ(xlator->getStaticDesc(xlator, -1, 0, qixlator_realloc, nullptr, &status), nullptr);
    expectReport(status, "error in error handling", "failed to get static desc\"");
    xlator->destroy(xlator);
}

TEST_P(ScriptFailuresTest, AScriptThatExhaustsMemoryIsReported) {
    FaultyAllocator::failAt(20000, FaultyAllocator::never);
    expectFailure("local t = {} while true do t[#t + 1] = ('x'):rep(1000) .. #t end",
                  "not enough memory");
    EXPECT_TRUE(FaultyAllocator::hasFailed());
}

TEST_P(ScriptFailuresTest, ASetUpThatExhaustsMemoryIsReported) {
    FaultyAllocator::failAt(20000, FaultyAllocator::never);
    expectNoModule("local t = {} while true do t[#t + 1] = ('x'):rep(1000) .. #t end",
                   "not enough memory", LUA_ERRMEM);
    EXPECT_TRUE(FaultyAllocator::hasFailed());
}

TEST_P(ScriptFailuresTest, ARegistrationTextThatIsNotJsonIsReported) {
    for (const char* text : {"", "   ", "x", "{", "[", "{]", "}", "os.exit(1)", "-", "nul"}) {
        expectNoTranslator(text, text, "json: .*");
    }
    expectNoTranslator("\"a", "\\\"a", "json: .*");
    expectNoTranslator("\xFF\xFE", "\xFF\xFE", "json: .*");
    expectNoTranslator("{\"a\":1,}", "{\\\"a\\\":1,}", "json: .*");
}

TEST_P(ScriptFailuresTest, ARegistrationTextThatIsNotAnObjectIsReported) {
    for (const char* text : {"5", "true", "null"}) {
        expectNoTranslator(text, text, ".*attempt to index local 'info' \\(a .* value\\)");
    }
}

TEST_P(ScriptFailuresTest, ARegistrationTextWithoutAModuleIsReported) {
    const std::string message = ".*bad argument #1 to 'require' \\(string expected, got .*\\)";
    expectNoTranslator("[]", "[]", message);
    expectNoTranslator("{}", "{}", message);
    expectNoTranslator("\"x\"", "\\\"x\\\"", message);
    expectNoTranslator("{\"qixlatorlua_xlator\":null}", "{\\\"qixlatorlua_xlator\\\":null}",
                       message);
    expectNoTranslator("{\"qixlatorlua_xlator\":{}}", "{\\\"qixlatorlua_xlator\\\":{}}", message);
    expectNoTranslator("{\"qixlatorlua_xlator\":true}", "{\\\"qixlatorlua_xlator\\\":true}",
                       message);
}

TEST_P(ScriptFailuresTest, ARegistrationTextWithAnUnknownModuleIsReported) {
    expectNoTranslator("{\"qixlatorlua_xlator\":\"missing\"}",
                       "{\\\"qixlatorlua_xlator\\\":\\\"missing\\\"}",
                       ".*module 'missing' not found:.*");
    expectNoTranslator("{\"qixlatorlua_xlator\":\"\"}", "{\\\"qixlatorlua_xlator\\\":\\\"\\\"}",
                       ".*module '' not found:.*");
    expectNoTranslator("{\"qixlatorlua_xlator\":\"definitions\"}",
                       "{\\\"qixlatorlua_xlator\\\":\\\"definitions\\\"}",
                       ".*module 'definitions' not found:.*");
}

TEST_P(ScriptFailuresTest, ARegistrationTextWithABadPathIsReported) {
    expectNoTranslator("{\"qixlatorlua_path\":7}", "{\\\"qixlatorlua_path\\\":7}",
                       ".*attempt to index local 'directories' \\(a number value\\)");
    expectNoTranslator("{\"qixlatorlua_path\":\"/x;$_tempDir\"}",
                       "{\\\"qixlatorlua_path\\\":\\\"/x;$_tempDir\\\"}",
                       ".*plugin dll path invalid.*dllPath.*\\$_tempDir.*");
}

TEST_P(ScriptFailuresTest, ADeeplyNestedRegistrationTextIsReported) {
    const std::string text(100000, '[');
    expectNoTranslator(text, text, ".*stack overflow.*");
}

TEST_P(ScriptFailuresTest, ANullRegistrationTextIsReported) {
    qierr::Status status;
    EXPECT_EQ(qixlatorlua::createLuaXlator("test_name", nullptr, GetParam(), &status), nullptr);
    EXPECT_EQ(status.code, -52003);
}

TEST_P(ScriptFailuresTest, AModuleThatIsNotATranslatorIsReportedAtItsFirstUse) {
    for (const char* script : {"", "return 5", "return true", "return {}",
                               "return { getStaticDesc = {}, getDynamicDesc = 5 }"}) {
        host.write("chunk", script);
        qierr::Status creation;
        XlatorInterface* xlator = host.create(host.registration("chunk"), &creation);
        ASSERT_NE(xlator, nullptr) << script;
        qierr::Status first;
        EXPECT_EQ(xlator->getStaticDesc(xlator, -1, 0, qixlator_realloc, nullptr, &first), nullptr);
        expectReport(first, ".*attempt to (index|call).*", "failed to get static desc\"");
        qierr::Status second;
        EXPECT_EQ(
            xlator->getDynamicDesc(xlator, "{}", 0, "json1", qixlator_realloc, nullptr, &second),
            nullptr);
        expectReport(second, ".*attempt to (index|call).*", "failed to get dynamic desc\"");
        xlator->destroy(xlator);
    }
}

}  // namespace
