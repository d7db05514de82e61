#include <gtest/gtest.h>

#include <cstdlib>
#include <string>

#include "ScriptHost.h"

namespace {

// The module qixlatorluautils, as scripts see it.
class NativeModuleTest : public testing::Test {
  protected:
    void SetUp() override { setenv("TMPDIR", "/the/temp", 1); }
    void TearDown() override { unsetenv("TMPDIR"); }

    // The text of an expression in which `u` is the module.
    std::string evaluate(const std::string& expression) {
        qierr::Status status;
        return host.run(
            "local u = require('qixlatorluautils') "
            "local ok, value = pcall(function() return " +
                expression + " end) return (ok and '' or 'error: ') .. tostring(value)",
            &status);
    }

    std::string shared(const std::string& below) const {
        return host.root.locate("/usr/local/qinstal/share" + below);
    }

    void explain(const std::string& directory) {
        host.root.write("/usr/local/qinstal/share" + directory + "/a.txt",
                        "<?xml version=\"1.0\"?>\n<qidocument>\n<qierror code=\"-1\">\nText.\n"
                        "</qierror>\n</qidocument>\n");
    }

    ScriptHost host{qixlatorlua::LuaRuntime::Fast};
};

TEST_F(NativeModuleTest, ExpandPathReplacesVariables) {
    EXPECT_EQ(evaluate("u.expandPath('n', '$_tempDir/x')"), "/the/temp/x");
    EXPECT_EQ(evaluate("u.expandPath('n', '$_unknown/x')"), "/x");
    EXPECT_EQ(evaluate("u.expandPath('n', '/plain/path')"), "/plain/path");
    EXPECT_EQ(evaluate("u.expandPath('n', 'a$_tempDir/b$_qiSharedDir/c')"),
              "a/the/temp/b" + shared("") + "/c");
    EXPECT_EQ(evaluate("u.expandPath('n', '$/x/y')"), "/x/y");
}

TEST_F(NativeModuleTest, AVariableMustBeFollowedByASlash) {
    const std::string error = evaluate("u.expandPath('n', '$_tempDir')");
    EXPECT_EQ(error.find("error: {\"error_constant\":\"qiapalerr_invalidParameter\""), 0u) << error;
    EXPECT_NE(std::string::npos,
              error.find("\"qixlator_debug\":{\"qixlatordll\":\"plugin dll path invalid\","
                         "\"dllPath\":\"$_tempDir\"}"))
        << error;
}

TEST_F(NativeModuleTest, AVariableThatRefersToItselfIsAnError) {
    setenv("TMPDIR", "$_tempDir/x", 1);
    EXPECT_NE(std::string::npos, evaluate("u.expandPath('n', '$_tempDir/')")
                                     .find("\"qixlatordll\":\"plugin dll path invalid\""));
}

TEST_F(NativeModuleTest, LookupVariableKnowsTheDirectories) {
    EXPECT_EQ(evaluate("u.lookupVariable('n', '_qiShared32Dir')"), shared(""));
    EXPECT_EQ(evaluate("u.lookupVariable('n', '_qiSharedDir')"), shared(""));
    EXPECT_EQ(evaluate("u.lookupVariable('n', '_commonAppDataDir')"),
              host.root.locate("/var/local/qinstal"));
    EXPECT_EQ(evaluate("u.lookupVariable('n', '_tempDir')"), "/the/temp");
    EXPECT_NE(std::string::npos,
              evaluate("u.lookupVariable('n', '_multiarchlibdir')").find("/usr/lib/" MULTIARCH));
    EXPECT_EQ(evaluate("u.lookupVariable('n', 'unknown')"), "");
    EXPECT_EQ(evaluate("u.lookupVariable('n', '')"), "");
}

TEST_F(NativeModuleTest, ConvertLangToDirKnowsSixLanguages) {
    EXPECT_EQ(evaluate("u.convertLangToDir(0)"), "English");
    EXPECT_EQ(evaluate("u.convertLangToDir(5)"), "ChineseS");
    const std::string error = evaluate("u.convertLangToDir(6)");
    EXPECT_NE(std::string::npos,
              error.find("\"qixlator_debug\":{\"qverrorsparser\":\"invalid language\",\"lang\":6}"))
        << error;
}

TEST_F(NativeModuleTest, SearchesReturnTheTextOrNil) {
    explain("/errors/French");
    const std::string errors = "'" + shared("/errors") + "'";
    EXPECT_EQ(evaluate("u.findErrorDescriptionFromErrorsDir(" + errors + ", -1, 1)"), "Text.");
    EXPECT_EQ(evaluate("u.findErrorDescriptionFromErrorsDir(" + errors + ", -2, 1)"), "nil");
    const std::string french = "'" + shared("/errors/French") + "'";
    EXPECT_EQ(evaluate("u.findErrorDescriptionFromDir(" + french + ", -1)"), "Text.");
    EXPECT_EQ(evaluate("u.findErrorDescriptionFromDir(" + french + ", -2)"), "nil");
}

TEST_F(NativeModuleTest, TheSearchOfAFileTakesADirectory) {
    explain("/errors/French");
    EXPECT_EQ(evaluate("u.findErrorDescriptionFromFile('" + shared("/errors/French") + "', -1)"),
              "Text.");
    EXPECT_EQ(
        evaluate("u.findErrorDescriptionFromFile('" + shared("/errors/French/a.txt") + "', -1)")
            .find("error: "),
        0u);
}

TEST_F(NativeModuleTest, AFailedSearchRaisesTheStatusText) {
    const std::string error = evaluate("u.findErrorDescriptionFromDir('/nowhere/at/all', -1)");
    EXPECT_EQ(error.find("error: {\"error_constant\":\"qiapalerr_resourceNotFound\""), 0u) << error;
    EXPECT_NE(std::string::npos, error.find("\"path\":\"/nowhere/at/all\"")) << error;
}

TEST_F(NativeModuleTest, MbsToUtf8ReturnsTheTextUnchanged) {
    EXPECT_EQ(evaluate("u.mbsToUtf8(3, 'caf\xC3\xA9')"), "caf\xC3\xA9");
    EXPECT_EQ(evaluate("u.mbsToUtf8(77, 'x')"), "x");
}

TEST_F(NativeModuleTest, ArgumentsAreChecked) {
    EXPECT_EQ(evaluate("u.expandPath('n')").find("error: "), 0u);
    EXPECT_EQ(evaluate("u.lookupVariable('n', {})").find("error: "), 0u);
    EXPECT_EQ(evaluate("u.findErrorDescriptionFromDir('x', 'y')").find("error: "), 0u);
    EXPECT_EQ(evaluate("u.convertLangToDir()").find("error: "), 0u);
}

TEST_F(NativeModuleTest, CodesAreNotMapped) {
    EXPECT_EQ(evaluate("qimxl_unmapErrorCode(-250800)"), "-250800");
}

}  // namespace
