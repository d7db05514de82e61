#include <gtest/gtest.h>

#include <string>
#include <utility>

#include "StatusTexts.h"
#include "support/CommaLocale.h"
#include "unit/qixlatorlua/ScriptHost.h"

namespace {

using statusTexts::usage;
using statusTexts::withEntries;

// The translator's script in a state that another script has prepared, with modules and settings
// that the service does not provide.
class ScriptedMxlatorTest : public testing::Test {
  protected:
    ~ScriptedMxlatorTest() override {
        if (xlator != nullptr) {
            xlator->destroy(xlator);
        }
    }

    void prepare(const std::string& script, const std::string& settings = "{}") {
        host.write("chunk", script + "\nreturn require('mxlator')");
        xlator = host.create("{\"qixlatorlua_xlator\":\"chunk\",\"qixlatorlua_path\":\"" +
                                 host.root.locate("/scripts") +
                                 "\",\"qixlatorlua_settings\":" + settings + "}",
                             &status);
        ASSERT_NE(xlator, nullptr) << status.json;
    }

    std::string describe(std::uint32_t attributes = 0) {
        return ScriptHost::taken(
            xlator->getStaticDesc(xlator, -1, attributes, qixlator_realloc, nullptr, &status));
    }

    std::string json1(const std::string& json, std::uint32_t attributes = 0) {
        return ScriptHost::taken(xlator->getDynamicDesc(xlator, json.c_str(), attributes, "json1",
                                                        qixlator_realloc, nullptr, &status));
    }

    std::string usageItem(const std::string& entry, std::uint32_t attributes = 0) {
        return json1(withEntries(entry), attributes);
    }

    void explain(const std::string& directory, const std::string& text) {
        host.root.write(directory + "/a.txt",
                        "<?xml version=\"1.0\"?>\n<qidocument>\n<qierror code=\"-1\">\n" + text +
                            "\n</qierror>\n</qidocument>\n");
    }

    // Expects that the script failed with this message, which the traceback follows.
    void expectFailure(const std::string& message) {
        EXPECT_EQ(status.code, -52003);
        EXPECT_TRUE(reported(status, message)) << status.json;
    }

    ScriptHost host{qixlatorlua::LuaRuntime::Plain};
    qierr::Status status;
    XlatorInterface* xlator = nullptr;
};

std::string holds(const std::string& text, const std::string& part) {
    return text.find(part) == std::string::npos ? "no " + part + " in " + text : "";
}

// ---- Attribute tables ---------------------------------------------------------------------------

TEST_F(ScriptedMxlatorTest, AMissingAttributeTableIsNamedAmongTheDebugItems) {
    prepare("package.preload.qimxl_defaultAttrTable = function() error('none') end");
    const std::string json = "{\"line\":12,\"translator\":\"x\"}";
    const std::string text = json1(json);
    EXPECT_EQ(status.code, 0);
    const std::size_t line = text.find("\"Line\"");
    const std::size_t missing = text.find("\"internal_error_string\"");
    const std::size_t rest = text.find("\"rest_of_input_json\"");
    EXPECT_LT(line, missing) << text;
    EXPECT_LT(missing, rest) << text;
    EXPECT_EQ(holds(text, "\"Cannot load qimxl_defaultAttrTable\\n\""), "");
}

TEST_F(ScriptedMxlatorTest, WithAnAttributeTableNoneIsNamedAmongTheDebugItems) {
    prepare("");
    EXPECT_EQ(json1("{\"line\":12}").find("internal_error_string"), std::string::npos);
}

TEST_F(ScriptedMxlatorTest, WithoutAnAttributeTableAnAttributeIsItsNumber) {
    prepare("package.preload.qimxl_defaultAttrTable = function() error('none') end");
    EXPECT_EQ(
        holds(usageItem(usage("kUsageTypeAttributeId", "4660", "\"uint32_t\"")), "\"0x00001234\""),
        "");
}

TEST_F(ScriptedMxlatorTest, EachEnvironmentHasItsAttributeTables) {
    prepare(
        "for _, name in ipairs({'eng_qv', 'eng_qvi', 'eng_qstudio', 'fra_qstudio', 'eng'}) do\n"
        "  package.preload['d_attributes_' .. name] = function()\n"
        "    return { encoding = 'utf-8', getAttribute = function(id)\n"
        "      return { shortName = name .. ' ' .. id, enums = {} } end }\n"
        "  end\n"
        "end",
        "{\"driverName\":\"d\"}");
    const std::string entry = usage("kUsageTypeAttributeId", "4660", "\"uint32_t\"");
    EXPECT_EQ(holds(usageItem(entry, 0x000), "\"eng 00001234\""), "");
    EXPECT_EQ(holds(usageItem(entry, 0x100), "\"eng_qv 00001234\""), "");
    EXPECT_EQ(holds(usageItem(entry, 0x200), "\"eng_qvi 00001234\""), "");
    EXPECT_EQ(holds(usageItem(entry, 0x300), "\"eng_qstudio 00001234\""), "");
    EXPECT_EQ(holds(usageItem(entry, 0x301), "\"fra_qstudio 00001234\""), "");
    EXPECT_EQ(holds(usageItem(entry, 0x302), "\"eng_qstudio 00001234\""), "");
    EXPECT_EQ(holds(usageItem(entry, 0xFFFFF300), "\"eng_qstudio 00001234\""), "");
}

// ---- Encodings ----------------------------------------------------------------------------------

TEST_F(ScriptedMxlatorTest, ADictionaryInAnotherEncodingIsRefused) {
    prepare(
        "package.preload.commonTerms_fra = function()\n"
        "  return { encoding = 'latin-1', getString = function() return 'x' end } end");
    const std::string entry = usage("kUsageTypeName", "\"n\"", "\"string\"");
    EXPECT_EQ(holds(usageItem(entry, 0), "\"Name\""), "");
    EXPECT_EQ(json1(withEntries(entry), 1), "(null)");
    expectFailure("Unsupported encoding");
}

TEST_F(ScriptedMxlatorTest, AnErrorTableInAnotherEncodingIsRefused) {
    prepare(
        "package.preload.errors_fra = function()\n"
        "  return { encoding = 'latin-1', getString = function() return 'x' end } end",
        "{\"qiSharedErrorsDir\":\"/nowhere\"}");
    EXPECT_EQ(describe(0), "Error description not found");
    EXPECT_EQ(describe(1), "(null)");
    expectFailure("Unsupported encoding");
}

// ---- Settings -----------------------------------------------------------------------------------

TEST_F(ScriptedMxlatorTest, ASharedErrorsDirectoryThatCannotBeExpandedIsAFailure) {
    prepare("", "{\"qiSharedErrorsDir\":\"$_tempDir\"}");
    EXPECT_EQ(describe(), "(null)");
    expectFailure("plugin dll path invalid");
    EXPECT_TRUE(reported(status, "\"qixlatorlua_debug\":{\"debug\":\"failed to get static desc\"}"))
        << status.json;
}

TEST_F(ScriptedMxlatorTest, ADriverErrorsDirectoryThatCannotBeExpandedIsAFailure) {
    prepare("",
            "{\"qiSharedErrorsDir\":\"/nowhere\",\"MIErrorsDir\":\"$_tempDir\","
            "\"driverName\":\"d\"}");
    EXPECT_EQ(describe(), "(null)");
    expectFailure("plugin dll path invalid");
}

TEST_F(ScriptedMxlatorTest, DriverFilesAreSearchedOnlyWithBothOfTheirSettings) {
    explain("/shared/English", "Shared.");
    explain("/drivers/d/English", "Driver.");
    const std::string shared = "\"qiSharedErrorsDir\":\"" + host.root.locate("/shared") + "\"";
    const std::string directory = "\"MIErrorsDir\":\"" + host.root.locate("/drivers") + "\"";
    for (const std::string& settings :
         {"{" + shared + "," + directory + "}", "{" + shared + ",\"driverName\":\"d\"}",
          "{" + shared + "}"}) {
        prepare("", settings);
        ASSERT_EQ(describe(), "Shared.") << settings;
        xlator->destroy(std::exchange(xlator, nullptr));
    }
    prepare("", "{" + shared + "," + directory + ",\"driverName\":\"d\"}");
    EXPECT_EQ(describe(), "Driver.");
    EXPECT_EQ(status.code, 0);
}

// ---- Names of languages -------------------------------------------------------------------------

TEST_F(ScriptedMxlatorTest, TheNamesOfTheLanguagesAreConvertedBothWays) {
    for (const auto& [word, name] :
         {std::pair("eng", "English"), std::pair("fra", "French"), std::pair("deu", "German"),
          std::pair("jpn", "Japanese"), std::pair("kor", "Korean"), std::pair("chs", "ChineseS")}) {
        const std::string function = "return require('qimxl_utilities').convertLang";
        EXPECT_EQ(host.run(function + "ShortToLong('" + word + "')", &status), name);
        EXPECT_EQ(host.run(function + "LongToShort('" + name + "')", &status), word);
    }
    EXPECT_EQ(host.run("return require('qimxl_utilities').convertLangShortToLong('zzz')", &status),
              "Zzzzzzz");
}

TEST_F(ScriptedMxlatorTest, AnUnknownNameOfALanguageGivesWhatTheLastKnownOneGave) {
    const std::string head = "local u = require('qimxl_utilities') return ";
    EXPECT_EQ(host.run(head + "tostring(u.convertLangLongToShort('Latin'))", &status), "nil");
    EXPECT_EQ(host.run(head + "tostring(u.convertLangLongToShort('Zzzzzzz'))", &status), "nil")
        << "the test language has no way back";
    EXPECT_EQ(host.run(head + "tostring(u.convertLangShortToLong('lat'))", &status), "nil");
    EXPECT_EQ(host.run(head + "u.convertLangLongToShort('German') .. ' ' .. "
                              "u.convertLangLongToShort('Latin')",
                       &status),
              "deu deu");
    EXPECT_EQ(host.run(head + "u.convertLangShortToLong('deu') .. ' ' .. "
                              "u.convertLangShortToLong('lat')",
                       &status),
              "German German");
    EXPECT_EQ(status.code, 0);
}

// ---- A locale with a decimal comma --------------------------------------------------------------

TEST_F(ScriptedMxlatorTest, NumbersKeepTheirPointUnderALocaleWithADecimalComma) {
    const CommaLocale locale;
    prepare("");
    EXPECT_EQ(holds(usageItem(usage("x", "-1.5", "\"double\"")), "\"-1.5\""), "");
    EXPECT_EQ(holds(usageItem(usage("x", "[0.25,3]", "\"double\"")), "[\"0.25\",\"3\"]"), "");
    EXPECT_EQ(holds(json1("{\"line\":12,\"real\":0.5}"), "{\\\"real\\\":0.5}"), "");
    EXPECT_EQ(status.code, 0);
}

TEST_F(ScriptedMxlatorTest, SettingsKeepTheirFractionsUnderALocaleWithADecimalComma) {
    const CommaLocale locale;
    prepare(
        "local json = require('json')\n"
        "package.preload.errors_eng = function()\n"
        "  return { encoding = 'utf-8', getString = function()\n"
        "    return json.encode({ qixlatorlua_settings.real, 0.25 }) end } end",
        "{\"qiSharedErrorsDir\":\"/nowhere\",\"real\":-1.5e-1}");
    EXPECT_EQ(describe(), "[-0.15,0.25]");
}

// Without a search path a module that is neither loaded nor preloaded is not looked for.
class UnsearchedMxlatorTest : public ScriptedMxlatorTest {
  protected:
    std::string describeAfter(const std::string& script) {
        prepare(script + "\npackage.path = ''", "{\"qiSharedErrorsDir\":\"/nowhere\"}");
        return describe();
    }
};

constexpr const char* errorTable = "{ encoding = 'utf-8', getString = function() return 'a' end }";

TEST_F(UnsearchedMxlatorTest, ALoadedErrorTableIsUsed) {
    EXPECT_EQ(describeAfter(std::string("package.loaded.errors_eng = ") + errorTable), "a");
}

TEST_F(UnsearchedMxlatorTest, APreloadedErrorTableIsUsed) {
    EXPECT_EQ(describeAfter(std::string("package.preload.errors_eng = function() return ") +
                            errorTable + " end"),
              "a");
}

TEST_F(UnsearchedMxlatorTest, AFailingErrorTableIsPassedOver) {
    EXPECT_EQ(describeAfter("package.preload.errors_eng = function() error('x') end"),
              "Error description not found");
}

}  // namespace
