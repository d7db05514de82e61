#include <gtest/gtest.h>
#include <unistd.h>

#include <cstdio>
#include <string>

#include "ScriptHost.h"

namespace {

// What the scripts of a translator cannot do, checked by scripts.
class RestrictionsTest : public testing::Test {
  protected:
    std::string run(const std::string& chunk) {
        qierr::Status status;
        const std::string text = host.run(chunk, &status);
        return status.code < 0 ? std::string("failed: ") + status.json : text;
    }

    // The message of the error that an expression raises.
    std::string errorOf(const std::string& expression) {
        return run("local ok, message = pcall(function() return " + expression +
                   " end) return (ok and 'no error: ' or '') .. tostring(message)");
    }

    ScriptHost host{qixlatorlua::LuaRuntime::Plain};
};

TEST_F(RestrictionsTest, NoProgramCanBeStartedWithAPipe) {
    EXPECT_NE(std::string::npos, errorOf("io.popen('true')").find(": 'popen' not supported"));
    EXPECT_NE(std::string::npos, errorOf("io.popen('true', 'w')").find(": 'popen' not supported"));
}

TEST_F(RestrictionsTest, PopenChecksItsArgumentsInOrder) {
    EXPECT_NE(std::string::npos,
              errorOf("io.popen({}, {})").find("bad argument #1 to 'popen' (string expected"));
    EXPECT_NE(std::string::npos,
              errorOf("io.popen('true', {})").find("bad argument #2 to 'popen' (string expected"));
}

TEST_F(RestrictionsTest, LoadlibReportsThatItIsAbsent) {
    EXPECT_EQ(run("local a, b, c = package.loadlib('libc.so.6', 'getpid') "
                  "return tostring(a) .. ' ' .. b .. ' ' .. c"),
              "nil dynamic libraries not enabled; check your Lua installation absent");
    EXPECT_EQ(run("local a, b, c = package.loadlib('libc.so.6', '*') "
                  "return tostring(a) .. ' ' .. b .. ' ' .. c"),
              "nil dynamic libraries not enabled; check your Lua installation absent");
}

TEST_F(RestrictionsTest, LoadlibChecksItsArgumentsInOrder) {
    EXPECT_NE(
        std::string::npos,
        errorOf("package.loadlib({}, {})").find("bad argument #1 to 'loadlib' (string expected"));
    EXPECT_NE(
        std::string::npos,
        errorOf("package.loadlib('x', {})").find("bad argument #2 to 'loadlib' (string expected"));
}

TEST_F(RestrictionsTest, AnExistingNativeModuleCannotBeLoaded) {
    host.root.write("/native/module.so", "whatever");
    const std::string path = host.root.locate("/native/module.so");
    host.write("paths", "package.cpath = '" + host.root.locate("/native/?.so") + "'");
    EXPECT_EQ(errorOf("require('paths') and require('module')"),
              "error loading module 'module' from file '" + path +
                  "':\n\tdynamic libraries not enabled; check your Lua installation");
    EXPECT_EQ(errorOf("require('paths') and require('module.part')"),
              "error loading module 'module.part' from file '" + path +
                  "':\n\tdynamic libraries not enabled; check your Lua installation");
}

TEST_F(RestrictionsTest, TheSearchForNativeModulesIsReportedAsTheInterpretersOwn) {
    host.write("paths", "package.path = '' package.cpath = '/nowhere/?.so;/else/?/x.so'");
    const std::string places =
        "module 'a.b' not found:\n\tno field package.preload['a.b']"
        "\n\tno file '/nowhere/a/b.so'\n\tno file '/else/a/b/x.so'"
        "\n\tno file '/nowhere/a.so'\n\tno file '/else/a/x.so'";
    const std::string error = errorOf("require('paths') and require('a.b')");
    ASSERT_LT(places.size(), error.size());
    EXPECT_EQ(error.substr(error.size() - places.size()), places);
}

TEST_F(RestrictionsTest, TheLoadersUseTheCurrentPath) {
    EXPECT_NE(std::string::npos, errorOf("rawset(package, 'cpath', nil) and require('a')")
                                     .find("'package.cpath' must be a string"));
}

TEST_F(RestrictionsTest, TheSearchPathForNativeModulesIsEmptyAfterTheSetUp) {
    EXPECT_EQ(run("return '[' .. package.cpath .. ']'"), "[]");
}

TEST_F(RestrictionsTest, TheDebugPromptHasTheNameOfTheHost) {
    // Standard input holds two commands and the end of the session.
    std::FILE* input = std::tmpfile();
    std::fputs("answer = 42\nerror('oops', 0)\nerror()\ncont\nnot read\n", input);
    std::rewind(input);
    const int savedInput = dup(STDIN_FILENO);
    dup2(fileno(input), STDIN_FILENO);
    std::clearerr(stdin);
    testing::internal::CaptureStderr();
    const std::string answer = run("debug.debug() return tostring(answer)");
    const std::string prompts = testing::internal::GetCapturedStderr();
    dup2(savedInput, STDIN_FILENO);
    close(savedInput);
    std::fclose(input);
    EXPECT_EQ(answer, "42");
    EXPECT_EQ(prompts, "hlua_debug> hlua_debug> oops\nhlua_debug> (no message)\nhlua_debug> ");
}

TEST_F(RestrictionsTest, TheOtherLibrariesAreAvailable) {
    EXPECT_EQ(run("local kinds = {} for _, name in ipairs({'table', 'io', 'os', 'string', 'math', "
                  "'debug', 'lfs', 'stdint', 'cjson', 'qixlatorluautils'}) do "
                  "kinds[#kinds + 1] = type(require(name)) end return table.concat(kinds, ' ')"),
              "table table table table table table table table table table");
}

}  // namespace
