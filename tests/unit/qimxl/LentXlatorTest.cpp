#include <dlfcn.h>
#include <gtest/gtest.h>
#include <qixlatormgr.h>

#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <regex>
#include <string>

#include "support/TestPaths.h"

// The built plug-in as another program uses it: through one symbol and the headers of the platform.
// Nothing of this system is linked, so the status and the allocation are this program's own.

namespace {

// ---- Another program ----------------------------------------------------------------------------

// Grows by exactly the requested size, whereas the plug-in's own function doubles its buffers.
std::int32_t exactRealloc(qierr_Status* status, std::uint32_t size) {
    if (size == 0) {
        std::free(status->json);
        status->json = nullptr;
        status->capacity = 0;
        return 1;
    }
    if (size <= status->capacity) {
        return 1;
    }
    auto* larger = static_cast<char*>(std::calloc(size, 1));
    const char* text = status->json == nullptr ? "{}" : status->json;
    std::memcpy(larger, text, std::strlen(text));
    larger[size - 1] = 'J';
    std::free(status->json);
    status->json = larger;
    status->capacity = size;
    return 1;
}

struct ForeignStatus : qierr_Status {
    ForeignStatus() : qierr_Status{0, 0, exactRealloc, nullptr} {}
    ~ForeignStatus() { exactRealloc(this, 0); }
    ForeignStatus(const ForeignStatus&) = delete;
    ForeignStatus& operator=(const ForeignStatus&) = delete;

    // The text, with # for the line of the source.
    std::string text() const {
        return std::regex_replace(json == nullptr ? "" : json, std::regex("\"line\":[0-9]+"),
                                  "\"line\":#");
    }
};

// Returns texts in one block of its own, which only it can free.
struct ForeignMemory {
    char block[4096] = "";
    int allocations = 0;
    int frees = 0;
    std::int32_t failure = 0;

    static void* allocate(void* pointer, std::uint32_t size, void* context, qierr_Status* status) {
        auto* self = static_cast<ForeignMemory*>(context);
        if (size == 0) {
            EXPECT_EQ(self->block + 16, pointer);
            ++self->frees;
            return nullptr;
        }
        EXPECT_EQ(pointer, nullptr);
        ++self->allocations;
        if (self->failure != 0) {
            status->code = self->failure;
            return nullptr;
        }
        EXPECT_GE(sizeof block - 16, size);
        return self->block + 16;
    }

    // A text that a translator returned; it is given back at the end.
    std::string take(char* text, qierr_Status* status) {
        const std::string copy = text == nullptr ? "(null)" : text;
        if (text != nullptr) {
            allocate(text, 0, this, status);
        }
        return copy;
    }
};

// ---- The tests ----------------------------------------------------------------------------------

class LentXlatorTest : public testing::Test {
  protected:
    LentXlatorTest() {
        std::string pattern =
            (std::filesystem::temp_directory_path() / "qitrmc-lent-XXXXXX").string();
        directory = mkdtemp(pattern.data());
        plugin = dlopen(pluginFile, RTLD_NOW | RTLD_LOCAL);
        EXPECT_NE(plugin, nullptr) << dlerror();
        create = reinterpret_cast<qixlator_exported_create_fn>(
            dlsym(plugin, "qixlator_exported_create"));
        EXPECT_NE(create, nullptr);
    }
    ~LentXlatorTest() override {
        dlclose(plugin);
        std::filesystem::remove_all(directory);
    }

    void write(const std::string& name, const std::string& content) const {
        const std::filesystem::path path = directory + "/" + name;
        std::filesystem::create_directories(path.parent_path());
        std::ofstream(path) << content;
    }

    void explain(const std::string& folder, const std::string& text) const {
        write(folder + "/a.txt", "<?xml version=\"1.0\"?>\n<qidocument>\n<qierror code=\"-77\">\n" +
                                     text + "\n</qierror>\n</qidocument>\n");
    }

    // A registration text of this program: a driver "foreign" with its files in the directory.
    std::string registration() const {
        return "{\"qixlatorlua_xlator\":\"mxlator\",\"qixlatorlua_path\":\"" + directory +
               "\",\"qixlatorlua_settings\":{\"driverName\":\"foreign\",\"qiSharedErrorsDir\":\"" +
               directory + "/errors\",\"MIErrorsDir\":\"" + directory + "/mierrors\"}}";
    }

    XlatorInterface* createLent() {
        XlatorInterface* xlator = create("mxlator_qitrmc", registration().c_str(), &status);
        EXPECT_NE(xlator, nullptr) << status.text();
        return xlator;
    }

    std::string describe(XlatorInterface* xlator, std::int32_t code, std::uint32_t attributes = 0) {
        return memory.take(xlator->getStaticDesc(xlator, code, attributes, ForeignMemory::allocate,
                                                 &memory, &status),
                           &status);
    }

    std::string describeJson(XlatorInterface* xlator, const std::string& json,
                             const char* format = "json1") {
        return memory.take(xlator->getDynamicDesc(xlator, json.c_str(), 0, format,
                                                  ForeignMemory::allocate, &memory, &status),
                           &status);
    }

    std::string directory;
    void* plugin = nullptr;
    qixlator_exported_create_fn create = nullptr;
    ForeignStatus status;
    ForeignMemory memory;
};

TEST_F(LentXlatorTest, DescribesCodesWithTheFilesOfItsRegistrationText) {
    explain("errors/English", "Shared text.");
    explain("errors/German", "Deutscher Text.");
    XlatorInterface* xlator = createLent();
    EXPECT_EQ(xlator->structSize, 16u);
    EXPECT_EQ(describe(xlator, -77), "Shared text.");
    EXPECT_EQ(describe(xlator, -77, 2), "Deutscher Text.");
    explain("mierrors/foreign/English", "Text of the driver.");
    EXPECT_EQ(describe(xlator, -77), "Text of the driver.");
    EXPECT_EQ(describe(xlator, -78), "Error description not found");
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(status.json, nullptr);
    EXPECT_EQ(memory.allocations, 4);
    EXPECT_EQ(memory.frees, 4);
    xlator->destroy(xlator);
}

TEST_F(LentXlatorTest, GivesTheItemsOfAStatus) {
    XlatorInterface* xlator = createLent();
    const std::string text = describeJson(
        xlator,
        "{\"translator_info\":{\"ordered_data\":[{\"type\":\"usage\",\"usage\":\"kUsageTypeName\","
        "\"value\":\"n\",\"value_type\":\"string\"}]}}");
    EXPECT_NE(std::string::npos, text.find("\"dynamic\":[{")) << text;
    EXPECT_NE(std::string::npos, text.find("\"key\":\"Name\"")) << text;
    EXPECT_NE(std::string::npos, text.find("\"value\":\"n\"")) << text;
    EXPECT_EQ(status.code, 0);
    xlator->destroy(xlator);
}

TEST_F(LentXlatorTest, TwoStatesOfOneProgramAreIndependent) {
    explain("errors/English", "Shared text.");
    XlatorInterface* first = createLent();
    XlatorInterface* second = createLent();
    first->destroy(first);
    EXPECT_EQ(describe(second, -77), "Shared text.");
    second->destroy(second);
}

TEST_F(LentXlatorTest, FailuresAreWrittenIntoTheCallersStatus) {
    XlatorInterface* xlator = createLent();
    EXPECT_EQ(describeJson(xlator, "{}", "json2"), "(null)");
    EXPECT_EQ(status.code, -52029);
    EXPECT_EQ(status.text(),
              "{\"error_constant\":\"(int32_t)lua_tointeger(L, -1)\","
              "\"file\":\"src/qixlatorlua/LuaXlator.cpp\",\"line\":#,\"component\":\"qitrmcsvc\","
              "\"qixlatorlua_debug\":{\"debug\":\"failed to get dynamic desc\"}}");
    EXPECT_EQ(status.json[status.capacity - 1], 'J');
    xlator->destroy(xlator);
}

TEST_F(LentXlatorTest, AWarningOfTheCallerDoesNotPreventATranslation) {
    explain("errors/English", "Shared text.");
    status.code = 5;
    XlatorInterface* xlator = createLent();
    EXPECT_EQ(describe(xlator, -77), "Shared text.");
    EXPECT_EQ(status.code, 5);
    xlator->destroy(xlator);
}

TEST_F(LentXlatorTest, AnAllocationThatFailsReturnsNoTextAndItsFailure) {
    XlatorInterface* xlator = createLent();
    memory.failure = -9;
    EXPECT_EQ(describe(xlator, -77), "(null)");
    EXPECT_EQ(status.code, -9);
    EXPECT_EQ(status.json, nullptr);
    xlator->destroy(xlator);
}

TEST_F(LentXlatorTest, AnUnknownNameIsReported) {
    EXPECT_EQ(create("qixlator_default", "{}", &status), nullptr);
    EXPECT_EQ(status.code, -52005);
    EXPECT_EQ(
        status.text(),
        "{\"error_constant\":\"qiapalerr_invalidParameter\",\"file\":\"src/qixlator/exported.cpp\","
        "\"line\":#,\"component\":\"qitrmcsvc\",\"qixlator_debug\":{\"qixlator_exported\":"
        "\"could not find xlator\",\"name\":\"qixlator_default\",\"registrationInfo\":\"{}\"}}");
}

TEST_F(LentXlatorTest, AnUnusableRegistrationTextIsReported) {
    EXPECT_EQ(create("mxlator_qitrmc", "{\"qixlatorlua_xlator\":\"none\"}", &status), nullptr);
    EXPECT_EQ(status.code, -52003);
    const std::string text = status.text();
    EXPECT_NE(std::string::npos,
              text.find("\"internal_error\":{\"api\":\"lua\",\"code\":2,\"string\":\""))
        << text;
    const std::string end =
        "\"},\"qixlatorlua_debug\":{\"debug\":\"lua setupEnv failed\",\"name\":\"mxlator_qitrmc\","
        "\"registrationInfo\":\"{\\\"qixlatorlua_xlator\\\":\\\"none\\\"}\"}}";
    ASSERT_LT(end.size(), text.size());
    EXPECT_EQ(text.substr(text.size() - end.size()), end);
}

// ---- The tables of a driver ---------------------------------------------------------------------

std::string entry(const std::string& tag, const std::string& value, const std::string& valueType) {
    return "{\"translator_info\":{\"ordered_data\":[{\"type\":\"usage\",\"usage\":\"" + tag +
           "\",\"value\":" + value + ",\"value_type\":" + valueType + "}]}}";
}

// The value of the one dynamic item of a json1 text.
std::string valueOf(const std::string& json1) {
    std::smatch found;
    const std::regex value("\"dynamic\":\\[\\{[^}]*\"value\":(\"[^\"]*\"|\\[[^\\]]*\\])");
    return std::regex_search(json1, found, value) ? found[1].str() : json1;
}

class DriverTablesTest : public LentXlatorTest {
  protected:
    // An attribute table that has the attribute 0000ABCD under this name.
    void nameAttribute(const std::string& module, const std::string& name) const {
        write(module + ".lua",
              "return { encoding = 'utf-8', getAttribute = function(attrid)\n"
              "if attrid == '0000ABCD' then return { shortName = '" +
                  name + "', enums = { ['3'] = 'Three' } } end end }");
    }

    // The name of that attribute in a new state.
    std::string attributeName(std::uint32_t attributes) {
        XlatorInterface* xlator = createLent();
        const std::string json = entry("kUsageTypeAttributeId", "43981", "\"uint32_t\"");
        const std::string text =
            memory.take(xlator->getDynamicDesc(xlator, json.c_str(), attributes, "json1",
                                               ForeignMemory::allocate, &memory, &status),
                        &status);
        xlator->destroy(xlator);
        return valueOf(text);
    }
};

TEST_F(DriverTablesTest, AttributesAndTheirEnumsHaveTheNamesOfTheTable) {
    nameAttribute("foreign_attributes_eng", "Gain");
    XlatorInterface* xlator = createLent();
    EXPECT_EQ(
        valueOf(describeJson(xlator, entry("kUsageTypeAttributeId", "43981", "\"uint32_t\""))),
        "\"Gain\"");
    EXPECT_EQ(valueOf(describeJson(
                  xlator, entry("kUsageTypeConflictingAttr", "[43981,1]", "\"uint32_t\""))),
              "[\"Gain\",\"0x00000001\"]");
    EXPECT_EQ(valueOf(describeJson(xlator, entry("kUsageTypeName", "43981", "\"uint32_t\""))),
              "\"43981\"");
    const std::string enumType = "{\"type\":\"enum\",\"id\":43981}";
    EXPECT_EQ(valueOf(describeJson(xlator, entry("x", "3", enumType))), "\"Three\"");
    EXPECT_EQ(valueOf(describeJson(xlator, entry("x", "[3,4]", enumType))), "[\"Three\",\"4\"]");
    EXPECT_EQ(status.code, 0);
    xlator->destroy(xlator);
}

TEST_F(DriverTablesTest, TheAttributeTableOfTheEnvironmentComesBeforeThatOfTheLanguage) {
    constexpr std::uint32_t german = 2;
    constexpr std::uint32_t secondEnvironment = 2 << 8;
    EXPECT_EQ(attributeName(german | secondEnvironment), "\"0x0000ABCD\"");
    nameAttribute("foreign_attributes_eng", "plain English");
    EXPECT_EQ(attributeName(german | secondEnvironment), "\"plain English\"");
    nameAttribute("foreign_attributes_deu", "plain German");
    EXPECT_EQ(attributeName(german | secondEnvironment), "\"plain German\"");
    nameAttribute("foreign_attributes_eng_qvi", "English of the environment");
    EXPECT_EQ(attributeName(german | secondEnvironment), "\"English of the environment\"");
    nameAttribute("foreign_attributes_deu_qvi", "German of the environment");
    EXPECT_EQ(attributeName(german | secondEnvironment), "\"German of the environment\"");
    EXPECT_EQ(attributeName(german), "\"plain German\"") << "no environment";
    EXPECT_EQ(attributeName(0), "\"plain English\"");
}

TEST_F(DriverTablesTest, AnErrorTableComesBeforeTheFiles) {
    explain("mierrors/foreign/English", "Text of a file.");
    write("errors_eng.lua",
          "return { encoding = 'utf-8', getString = function(code) "
          "if code == -77 then return 'English table.' end end }");
    XlatorInterface* xlator = createLent();
    EXPECT_EQ(describe(xlator, -77), "English table.");
    EXPECT_EQ(describe(xlator, -77, 1), "English table.");
    EXPECT_EQ(describe(xlator, -78), "Error description not found");
    write("errors_fra.lua",
          "return { encoding = 'utf-8', getString = function() return 'Table.' end }");
    EXPECT_EQ(describe(xlator, -77, 1), "Table.");
    xlator->destroy(xlator);
}

TEST_F(DriverTablesTest, AnErrorTableInAnotherEncodingIsAFailure) {
    write("errors_eng.lua",
          "return { encoding = 'latin-1', getString = function() return 'x' end }");
    XlatorInterface* xlator = createLent();
    EXPECT_EQ(describe(xlator, -77), "(null)");
    EXPECT_EQ(status.code, -52003);
    EXPECT_NE(std::string::npos, status.text().find("Unsupported encoding")) << status.text();
    xlator->destroy(xlator);
}

}  // namespace
