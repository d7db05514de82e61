#include <dlfcn.h>
#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "TestXlator.h"
#include "qixlator/exported.h"
#include "qixlator/qixlator.h"
#include "support/FaultyAllocator.h"
#include "support/TestPaths.h"
#include "support/TestRoot.h"

namespace {

using Calls = std::vector<std::string>;

bool reported(const qierr_Status& status, const std::string& part) {
    return status.json != nullptr && std::string(status.json).find(part) != std::string::npos;
}

// A loaded library is found by its name wherever it was loaded from, so loading one of the
// stand-ins makes it the manager of this process.
class Manager {
  public:
    explicit Manager(const char* path) : handle(dlopen(path, RTLD_NOW)) {}
    ~Manager() { dlclose(handle); }

    std::string calls() const {
        return reinterpret_cast<const char* (*)()>(dlsym(handle, "manager_calls"))();
    }

  private:
    void* handle;
};

class SessionTest : public testing::Test {
  protected:
    SessionTest() : session(qixlator_createSession(&status)) {}
    ~SessionTest() override { qixlator_destroySession(session); }

    std::string describe(const char* xlatorName, std::int32_t code, qierr_Status* failure) {
        return taken(qixlator_getStaticDesc(session, code, xlatorName, 0x200, qixlator_realloc,
                                            nullptr, failure));
    }

    std::string describeJson(const char* json, qierr_Status* failure) {
        return taken(qixlator_getDynamicDesc(session, json, 0x200, "json1", qixlator_realloc,
                                             nullptr, failure));
    }

    static std::string taken(char* text) {
        const std::string copy = text == nullptr ? "(null)" : text;
        qixlator_realloc(text, 0, nullptr, nullptr);
        return copy;
    }

    TestRoot root;
    qierr::Status status;
    qixlator::Session* session;
};

// ---- Translators of this program ----------------------------------------------------------------

TEST_F(SessionTest, ATranslatorIsCreatedOnceAndDestroyedWithTheSession) {
    TestXlator xlator("test");
    xlator.descriptions[-1] = "minus one";
    EXPECT_EQ(describe("test", -1, &status), "minus one");
    EXPECT_EQ(describe("test", -1, &status), "minus one");
    EXPECT_EQ(describe("test", -2, &status), "(null)");
    EXPECT_EQ(status.code, 0);
    qixlator_destroySession(session);
    session = nullptr;
    EXPECT_EQ(xlator.calls, (Calls{"create test with the registration text", "static -1 512",
                                   "static -1 512", "static -2 512", "destroy"}));
}

TEST_F(SessionTest, TranslatorsAreDestroyedInTheOrderOfTheirCreation) {
    TestXlator first("first");
    TestXlator second("second");
    describe("second", -1, &status);
    describe("first", -1, &status);
    TestXlator::destroyed().clear();
    qixlator_destroySession(session);
    session = nullptr;
    EXPECT_EQ(TestXlator::destroyed(), (Calls{"second", "first"}));
}

TEST_F(SessionTest, AFailedCreationIsReportedAndRepeatedAtTheNextUse) {
    TestXlator xlator("test");
    xlator.failure = -9;
    EXPECT_EQ(describe("test", -1, &status), "(null)");
    EXPECT_EQ(status.code, -9);
    qierr::Status second;
    xlator.failure = 0;
    xlator.descriptions[-1] = "minus one";
    EXPECT_EQ(describe("test", -1, &second), "minus one");
}

TEST_F(SessionTest, AStatusNamesItsTranslator) {
    TestXlator xlator("te st");
    xlator.json1 = "{}";
    const std::string json = "{\"translator\":\"te\\u0020st\"}";
    EXPECT_EQ(describeJson(json.c_str(), &status), "{}");
    EXPECT_EQ(xlator.calls.back(), "dynamic json1 " + json);
}

TEST_F(SessionTest, AStatusWithoutTranslatorHasNoDynamicDescription) {
    for (const char* json :
         {"{}", "{\"translator\":\"\"}", "{\"translator\":5}", "[]", "{\"translator\""}) {
        qierr::Status failure;
        EXPECT_EQ(describeJson(json, &failure), "(null)") << json;
        EXPECT_EQ(failure.code, -52006) << json;
        EXPECT_TRUE(reported(failure,
                             "\"qixlator_debug\":{\"debug\":\"could not find translator key in "
                             "json\",\"json\":\""))
            << failure.json;
    }
}

TEST_F(SessionTest, TheDefaultTranslatorHasNoDynamicDescriptions) {
    EXPECT_EQ(describeJson("{\"translator\":\"qixlator_default\"}", &status), "(null)");
    EXPECT_EQ(status.code, -52006);
    EXPECT_TRUE(reported(status,
                         "\"qixlator_debug\":{\"debug\":\"xlator doesn't support getDynamicDesc\","
                         "\"xlatorName\":\"qixlator_default\"}"))
        << status.json;
}

TEST_F(SessionTest, ATranslatorMayLackStaticDescriptions) {
    static XlatorInterface bare = {16, [](XlatorInterface*) {}, nullptr, nullptr};
    const qixlator::XlatorRegistration registration(
        qixlator::localRegistrations(), "bare", "{}",
        [](const char*, const char*, qierr_Status*) { return &bare; });
    EXPECT_EQ(describe("bare", -1, &status), "(null)");
    EXPECT_EQ(status.code, -52006);
    EXPECT_TRUE(reported(status,
                         "\"qixlator_debug\":{\"debug\":\"xlator doesn't support getStaticDesc\","
                         "\"xlatorName\":\"bare\"}"))
        << status.json;
}

TEST_F(SessionTest, NothingIsDoneWhenTheStatusIsNegative) {
    TestXlator xlator("test");
    status.code = -1;
    EXPECT_EQ(describe("test", -1, &status), "(null)");
    EXPECT_EQ(describeJson("{\"translator\":\"test\"}", &status), "(null)");
    EXPECT_EQ(qixlator_createSession(&status), nullptr);
    EXPECT_EQ(qixlator_exported_create("test", "{}", &status), nullptr);
    EXPECT_EQ(xlator.calls, Calls{});
    EXPECT_EQ(status.json, nullptr);
}

TEST_F(SessionTest, ASessionWithoutMemoryIsReported) {
    for (int allocation = 0; allocation < 2; ++allocation) {
        const std::int64_t before = FaultyAllocator::liveBlocks();
        qierr::Status failure;
        FaultyAllocator::failAt(allocation);
        EXPECT_EQ(qixlator_createSession(&failure), nullptr);
        FaultyAllocator::succeed();
        EXPECT_EQ(failure.code, -52000);
        EXPECT_TRUE(reported(
            failure, "\"qixlator_debug\":{\"debug\":\"failed to allocate Session memory\"}"))
            << failure.json;
        EXPECT_EQ(FaultyAllocator::liveBlocks(), before);
    }
}

TEST_F(SessionTest, ATranslatorThatCannotBeStoredIsDestroyedAtOnce) {
    TestXlator xlator("test");
    FaultyAllocator::failAt(0);
    EXPECT_EQ(describe("test", -1, &status), "(null)");
    FaultyAllocator::succeed();
    EXPECT_EQ(status.code, -52000);
    EXPECT_EQ(xlator.calls, (Calls{"create test with the registration text", "destroy"}));
}

TEST_F(SessionTest, TheTableOfTranslatorsGrows) {
    std::vector<std::string> names;
    std::vector<std::unique_ptr<TestXlator>> xlators;
    for (int number = 0; number < 10; ++number) {
        names.push_back("test" + std::to_string(number));
    }
    for (const std::string& name : names) {
        xlators.push_back(std::make_unique<TestXlator>(name.c_str()));
        describe(name.c_str(), -1, &status);
    }
    for (const std::string& name : names) {
        describe(name.c_str(), -2, &status);
    }
    EXPECT_EQ(status.code, 0);
    for (const auto& xlator : xlators) {
        EXPECT_EQ(xlator->calls.size(), 3u);
    }
    qixlator_destroySession(session);
    session = nullptr;
}

// ---- The manager library ------------------------------------------------------------------------

TEST_F(SessionTest, WithoutTheManagerAnUnknownNameReportsTheLoadersFailure) {
    TestXlator local("test");
    local.descriptions[-1] = "minus one";
    EXPECT_EQ(describe("known", -1, &status), "(null)");
    EXPECT_EQ(status.code, -52005);
    EXPECT_TRUE(reported(status,
                         "\"qidynlib_debug\":{\"debug\":\"failed to qidynlib_load library\","
                         "\"path\":\"libqixlator.so.1\"},\"internal_error\":{\"api\":\"dlerror\""))
        << status.json;
    qierr::Status localStatus;
    EXPECT_EQ(describe("test", -1, &localStatus), "minus one");
}

TEST_F(SessionTest, AFailedLoadIsNotRepeatedInTheSession) {
    EXPECT_EQ(describe("known", -1, &status), "(null)");
    const Manager manager(completeManager);
    qierr::Status second;
    EXPECT_EQ(describe("known", -1, &second), "(null)");
    EXPECT_EQ(second.code, -52005);
    EXPECT_STREQ(status.json, second.json);
    EXPECT_EQ(manager.calls(), "");
}

TEST_F(SessionTest, TheManagerProvidesUnknownNames) {
    const Manager manager(completeManager);
    EXPECT_EQ(describe("known", -7, &status), "managed -7");
    EXPECT_EQ(describe("known", -8, &status), "managed -8");
    EXPECT_EQ(status.code, 0);
    EXPECT_EQ(manager.calls(), "createSession;createXlator;");
    EXPECT_EQ(describe("unknown", -7, &status), "(null)");
    EXPECT_EQ(status.code, -6);
    qixlator_destroySession(session);
    session = nullptr;
    EXPECT_EQ(manager.calls(),
              "createSession;createXlator;createXlator;destroyXlator;destroySession;");
}

TEST_F(SessionTest, AManagersTranslatorThatCannotBeStoredIsReturnedAtOnce) {
    const Manager manager(completeManager);
    FaultyAllocator::failAt(0);
    EXPECT_EQ(describe("known", -7, &status), "(null)");
    FaultyAllocator::succeed();
    EXPECT_EQ(status.code, -52000);
    EXPECT_EQ(manager.calls(), "createSession;createXlator;destroyXlator;");
}

TEST_F(SessionTest, AManagerThatLacksAFunctionIsUnloaded) {
    {
        const Manager manager(lackingManager);
        EXPECT_EQ(describe("known", -7, &status), "(null)");
        EXPECT_EQ(status.code, -52005);
        EXPECT_TRUE(reported(status, "\"qidynlib_symbol\":\"qixlatormgr_destroyXlator\""))
            << status.json;
        EXPECT_EQ(manager.calls(), "");
    }
    EXPECT_EQ(dlopen(lackingManager, RTLD_NOW | RTLD_NOLOAD), nullptr);
}

TEST_F(SessionTest, AManagerWithoutASessionIsUnloadedAndNotUsedAgain) {
    {
        const Manager manager(failingManager);
        EXPECT_EQ(describe("known", -7, &status), "(null)");
        EXPECT_EQ(status.code, -5);
        qierr::Status second;
        EXPECT_EQ(describe("known", -7, &second), "(null)");
        EXPECT_EQ(second.code, -5);
        EXPECT_EQ(manager.calls(), "createSession;destroySession;");
    }
    EXPECT_EQ(dlopen(failingManager, RTLD_NOW | RTLD_NOLOAD), nullptr);
}

// ---- What this program lends --------------------------------------------------------------------

TEST_F(SessionTest, AnExportedTranslatorIsMadeWithTheCallersText) {
    static std::string seen;
    static XlatorInterface bare = {16, nullptr, nullptr, nullptr};
    const qixlator::XlatorRegistration registration(
        qixlator::exportedRegistrations(), "lent", nullptr,
        [](const char* name, const char* info, qierr_Status*) {
            seen = std::string(name) + " " + info;
            return &bare;
        });
    EXPECT_EQ(qixlator_exported_create("lent", "{\"a\":1}", &status), &bare);
    EXPECT_EQ(seen, "lent {\"a\":1}");
}

TEST_F(SessionTest, AnUnknownExportIsReported) {
    EXPECT_EQ(qixlator_exported_create("qixlator_default", "{}", &status), nullptr);
    EXPECT_EQ(status.code, -52005);
    EXPECT_TRUE(reported(status,
                         "\"qixlator_debug\":{\"qixlator_exported\":\"could not find xlator\","
                         "\"name\":\"qixlator_default\",\"registrationInfo\":\"{}\"}"))
        << status.json;
}

TEST_F(SessionTest, ARegistrationUnlinksItselfAtItsEnd) {
    { const TestXlator xlator("test"); }
    EXPECT_EQ(qixlator::localRegistrations().find("test"), nullptr);
    EXPECT_NE(qixlator::localRegistrations().find("qixlator_default"), nullptr);
}

// ---- The framework's allocation -----------------------------------------------------------------

TEST_F(SessionTest, ReallocReportsLackOfMemory) {
    FaultyAllocator::failAt(0, 2);
    EXPECT_EQ(qixlator_realloc(nullptr, 8, nullptr, nullptr), nullptr);
    EXPECT_EQ(qixlator_realloc(nullptr, 8, nullptr, &status), nullptr);
    FaultyAllocator::succeed();
    EXPECT_EQ(status.code, -52000);
    EXPECT_TRUE(reported(status, "\"qixlator_debug\":{\"debug\":\"realloc failed\"}"));
    EXPECT_EQ(qixlator_realloc(nullptr, 8, nullptr, &status), nullptr);
    EXPECT_EQ(FaultyAllocator::requests(), 0u);
}

TEST_F(SessionTest, ReallocFreesWhateverTheStatusIs) {
    const std::int64_t before = FaultyAllocator::liveBlocks();
    void* block = qixlator_realloc(nullptr, 8, nullptr, &status);
    EXPECT_NE(block, nullptr);
    status.code = -1;
    EXPECT_EQ(qixlator_realloc(block, 0, nullptr, &status), nullptr);
    EXPECT_EQ(FaultyAllocator::liveBlocks(), before);
}

// ---- The default translator ---------------------------------------------------------------------

class DefaultXlatorTest : public SessionTest {
  protected:
    void explain(const std::string& directory, const std::string& code, const std::string& text) {
        root.write("/usr/local/qinstal/share/errors" + directory + "/status.txt",
                   "<?xml version=\"1.0\"?>\n<qidocument>\n<qierror code=\"" + code + "\">\n" +
                       text + "\n</qierror>\n</qidocument>\n");
    }

    std::string describeIn(std::uint32_t attributes, qierr_Status* failure) {
        return taken(qixlator_getStaticDesc(session, -1, "qixlator_default", attributes,
                                            qixlator_realloc, nullptr, failure));
    }
};

TEST_F(DefaultXlatorTest, FindsTheTextInTheLanguage) {
    explain("/English", "-1", "English text.");
    explain("/German", "-1", "Deutscher Text.");
    EXPECT_EQ(describeIn(2, &status), "Deutscher Text.");
    EXPECT_EQ(describeIn(0x300, &status), "English text.");
}

TEST_F(DefaultXlatorTest, FallsBackToEnglish) {
    explain("/English", "-1", "English text.");
    EXPECT_EQ(describeIn(2, &status), "English text.") << "no directory of the language";
    explain("/German", "-2", "Anderer Text.");
    EXPECT_EQ(describeIn(2, &status), "English text.") << "no text in the language";
    EXPECT_EQ(describeIn(77, &status), "English text.") << "no such language";
    EXPECT_EQ(status.code, 0);
}

TEST_F(DefaultXlatorTest, ATextOutsideTheLanguageDirectoriesIsUsedForAnyLanguage) {
    explain("/English", "-2", "Other text.");
    explain("/French", "-2", "Autre texte.");
    explain("", "-1", "Text for all.");
    EXPECT_EQ(describeIn(1, &status), "Text for all.");
}

TEST_F(DefaultXlatorTest, ACodeWithoutTextIsReported) {
    explain("/English", "-2", "Other text.");
    EXPECT_EQ(describeIn(0x302, &status), "(null)");
    EXPECT_EQ(status.code, -52006);
    EXPECT_TRUE(reported(status,
                         "\"qixlator_debug\":{\"qixlator_defaultTranslator\":\"couldn't find "
                         "description for code\",\"code\":-1,\"lang\":0,\"ade\":3}"))
        << status.json;
}

TEST_F(DefaultXlatorTest, TheEnvironmentIsFourBitsOfTheAttributes) {
    explain("/English", "-2", "Other text.");
    for (const auto& [attributes, ade] :
         {std::pair(0xF00u, "15"), std::pair(0xFFFFF2FFu, "2"), std::pair(0x1000u, "0")}) {
        qierr::Status failure;
        EXPECT_EQ(describeIn(attributes, &failure), "(null)");
        EXPECT_TRUE(reported(failure, std::string("\"lang\":0,\"ade\":") + ade + "}"))
            << failure.json;
    }
}

TEST_F(DefaultXlatorTest, MissingDirectoriesAreReportedWithTheEnglishDirectory) {
    EXPECT_EQ(describeIn(2, &status), "(null)");
    EXPECT_EQ(status.code, -52006);
    EXPECT_TRUE(reported(status, "\"debug\":\"open dir failed\",\"path\":\"" +
                                     root.locate("/usr/local/qinstal/share/errors/English") + "\""))
        << status.json;
}

}  // namespace
