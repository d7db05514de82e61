#include "TemporaryIni.h"

using namespace ini_test;

namespace {

struct Read {
    std::int32_t result;
    std::uint32_t value = 77;
};

Read readEnable(const std::string& content) {
    const File file = loaded(content);
    Read read;
    read.result = IniFile_getInt(file.get(), "WebService", "Enable", &read.value);
    return read;
}

void expectRead(const std::string& content, std::uint32_t value) {
    SCOPED_TRACE(content);
    const Read read = readEnable(content);
    EXPECT_EQ(read.result, 1);
    EXPECT_EQ(read.value, value);
}

void expectNone(const std::string& content, std::int32_t result) {
    SCOPED_TRACE(content);
    const Read read = readEnable(content);
    EXPECT_EQ(read.result, result);
    EXPECT_EQ(read.value, 77u);
}

}  // namespace

TEST(IniGetInt, FindsNamesInAnyCase) {
    expectRead("[WebService]\nEnable = 1\n", 1);
    expectRead("[webservice]\nenable=1\n", 1);
    expectRead("[ WEBSERVICE ]\n  ENABLE  =  1\n", 1);
    expectRead("\xEF\xBB\xBF[WebService]\r\nEnable=7\r\n", 7);
}

TEST(IniGetInt, IgnoresBlanksInFrontOfTheWantedNames) {
    const File file = loaded("[WebService]\nEnable=1\n");
    std::uint32_t value = 0;
    EXPECT_EQ(IniFile_getInt(file.get(), "  WebService", "\tEnable", &value), 1);
    EXPECT_EQ(IniFile_getInt(file.get(), "WebService ", "Enable", &value), 0);
}

TEST(IniGetInt, MissingNamesGiveZero) {
    expectNone("", 0);
    expectNone("[Other]\nEnable=1\n", 0);
    expectNone("[WebService]\nEnabled=1\n", 0);
    expectNone("Enable=1\n", 0);
    expectNone("[WebService2]\nEnable=1\n", 0);
}

TEST(IniGetInt, EmptyValuesGiveZero) {
    expectNone("[WebService]\nEnable =\n", 0);
    expectNone("[WebService]\nEnable = \"\"\n", 0);
}

TEST(IniGetInt, ReadsUnsignedDecimals) {
    expectRead("[WebService]\nEnable=0\n", 0);
    expectRead("[WebService]\nEnable=007\n", 7);
    expectRead("[WebService]\nEnable=+5\n", 5);
    expectRead("[WebService]\nEnable=\"  5\t\"\n", 5);
    expectRead("[WebService]\nEnable=4294967295\n", 4294967295u);
    expectRead("[WebService]\nEnable=1\nEnable=2\n", 2);
}

TEST(IniGetInt, RefusesEverythingElse) {
    for (const char* value : {"yes", "True", "-1", "-0", "4294967296", "99999999999999999999",
                              "1.0", "1 2", "0x1", "+", "-", "+ 1", "++1", "+-1", "1;", "\" \""}) {
        expectNone("[WebService]\nEnable=" + std::string(value) + "\n", -5022);
    }
}
