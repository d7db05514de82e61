#include <dlfcn.h>
#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

#include "TestXlator.h"
#include "qixlator/exportedXlators.h"
#include "qixlator/qixlator.h"
#include "support/FaultyAllocator.h"
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
    EXPECT_EQ("minus one", describe("test", -1, &status));
    EXPECT_EQ("minus one", describe("test", -1, &status));
    EXPECT_EQ("(null)", describe("test", -2, &status));
    EXPECT_EQ(0, status.code);
    qixlator_destroySession(session);
    session = nullptr;
    EXPECT_EQ((Calls{"create test with the registration text", "static -1 512", "static -1 512",
                     "static -2 512", "destroy"}),
              xlator.calls);
}

TEST_F(SessionTest, TranslatorsAreDestroyedInTheOrderOfTheirCreation) {
    TestXlator first("first");
    TestXlator second("second");
    describe("second", -1, &status);
    describe("first", -1, &status);
    TestXlator::destroyed().clear();
    qixlator_destroySession(session);
    session = nullptr;
    EXPECT_EQ((Calls{"second", "first"}), TestXlator::destroyed());
}

TEST_F(SessionTest, AFailedCreationIsReportedAndTriedAgain) {
    TestXlator xlator("test");
    xlator.failure = -9;
    EXPECT_EQ("(null)", describe("test", -1, &status));
    EXPECT_EQ(-9, status.code);
    qierr::Status second;
    xlator.failure = 0;
    xlator.descriptions[-1] = "minus one";
    EXPECT_EQ("minus one", describe("test", -1, &second));
}

TEST_F(SessionTest, AStatusNamesItsTranslator) {
    TestXlator xlator("te st");
    xlator.json1 = "{}";
    const std::string json = "{\"translator\":\"te\\u0020st\"}";
    EXPECT_EQ("{}", describeJson(json.c_str(), &status));
    EXPECT_EQ("dynamic json1 " + json, xlator.calls.back());
}

TEST_F(SessionTest, AStatusWithoutTranslatorHasNoDynamicDescription) {
    for (const char* json :
         {"{}", "{\"translator\":\"\"}", "{\"translator\":5}", "[]", "{\"translator\""}) {
        qierr::Status failure;
        EXPECT_EQ("(null)", describeJson(json, &failure)) << json;
        EXPECT_EQ(-52006, failure.code) << json;
        EXPECT_TRUE(reported(failure,
                             "\"qixlator_debug\":{\"debug\":\"could not find translator key in "
                             "json\",\"json\":\""))
            << failure.json;
    }
}

TEST_F(SessionTest, TheDefaultTranslatorHasNoDynamicDescriptions) {
    EXPECT_EQ("(null)", describeJson("{\"translator\":\"qixlator_default\"}", &status));
    EXPECT_EQ(-52006, status.code);
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
    EXPECT_EQ("(null)", describe("bare", -1, &status));
    EXPECT_EQ(-52006, status.code);
    EXPECT_TRUE(reported(status,
                         "\"qixlator_debug\":{\"debug\":\"xlator doesn't support getStaticDesc\","
                         "\"xlatorName\":\"bare\"}"))
        << status.json;
}

TEST_F(SessionTest, NothingIsDoneWhenTheStatusIsNegative) {
    TestXlator xlator("test");
    status.code = -1;
    EXPECT_EQ("(null)", describe("test", -1, &status));
    EXPECT_EQ("(null)", describeJson("{\"translator\":\"test\"}", &status));
    EXPECT_EQ(nullptr, qixlator_createSession(&status));
    EXPECT_EQ(nullptr, qixlator_exported_create("test", "{}", &status));
    EXPECT_EQ(Calls{}, xlator.calls);
    EXPECT_EQ(nullptr, status.json);
}

TEST_F(SessionTest, ASessionWithoutMemoryIsReported) {
    for (int allocation = 0; allocation < 2; ++allocation) {
        const std::int64_t before = FaultyAllocator::liveBlocks();
        qierr::Status failure;
        FaultyAllocator::failAt(allocation);
        EXPECT_EQ(nullptr, qixlator_createSession(&failure));
        FaultyAllocator::succeed();
        EXPECT_EQ(-52000, failure.code);
        EXPECT_TRUE(reported(
            failure, "\"qixlator_debug\":{\"debug\":\"failed to allocate Session memory\"}"))
            << failure.json;
        EXPECT_EQ(before, FaultyAllocator::liveBlocks());
    }
}

TEST_F(SessionTest, ATranslatorThatCannotBeKeptIsDestroyedAtOnce) {
    TestXlator xlator("test");
    FaultyAllocator::failAt(0);
    EXPECT_EQ("(null)", describe("test", -1, &status));
    FaultyAllocator::succeed();
    EXPECT_EQ(-52000, status.code);
    EXPECT_EQ((Calls{"create test with the registration text", "destroy"}), xlator.calls);
}

TEST_F(SessionTest, MoreTranslatorsThanThereIsRoomForAtFirstAreKept) {
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
    EXPECT_EQ(0, status.code);
    for (const auto& xlator : xlators) {
        EXPECT_EQ(3u, xlator->calls.size());
    }
    qixlator_destroySession(session);
    session = nullptr;
}

// ---- The manager library ------------------------------------------------------------------------

TEST_F(SessionTest, WithoutTheManagerAnUnknownNameIsTheLoadersFailure) {
    TestXlator local("test");
    local.descriptions[-1] = "minus one";
    EXPECT_EQ("(null)", describe("known", -1, &status));
    EXPECT_EQ(-52005, status.code);
    EXPECT_TRUE(reported(status,
                         "\"qidynlib_debug\":{\"debug\":\"failed to qidynlib_load library\","
                         "\"path\":\"libqixlator.so.1\"},\"internal_error\":{\"api\":\"dlerror\""))
        << status.json;
    qierr::Status localStatus;
    EXPECT_EQ("minus one", describe("test", -1, &localStatus));
}

TEST_F(SessionTest, AFailedLoadIsNotRepeatedInTheSession) {
    EXPECT_EQ("(null)", describe("known", -1, &status));
    const Manager manager(MANAGER_COMPLETE);
    qierr::Status second;
    EXPECT_EQ("(null)", describe("known", -1, &second));
    EXPECT_EQ(-52005, second.code);
    EXPECT_STREQ(status.json, second.json);
    EXPECT_EQ("", manager.calls());
}

TEST_F(SessionTest, TheManagerServesUnknownNames) {
    const Manager manager(MANAGER_COMPLETE);
    EXPECT_EQ("managed -7", describe("known", -7, &status));
    EXPECT_EQ("managed -8", describe("known", -8, &status));
    EXPECT_EQ(0, status.code);
    EXPECT_EQ("createSession;createXlator;", manager.calls());
    EXPECT_EQ("(null)", describe("unknown", -7, &status));
    EXPECT_EQ(-6, status.code);
    qixlator_destroySession(session);
    session = nullptr;
    EXPECT_EQ("createSession;createXlator;createXlator;destroyXlator;destroySession;",
              manager.calls());
}

TEST_F(SessionTest, TheManagersTranslatorThatCannotBeKeptGoesBackAtOnce) {
    const Manager manager(MANAGER_COMPLETE);
    FaultyAllocator::failAt(0);
    EXPECT_EQ("(null)", describe("known", -7, &status));
    FaultyAllocator::succeed();
    EXPECT_EQ(-52000, status.code);
    EXPECT_EQ("createSession;createXlator;destroyXlator;", manager.calls());
}

TEST_F(SessionTest, AManagerThatLacksAFunctionIsUnloaded) {
    {
        const Manager manager(MANAGER_LACKING);
        EXPECT_EQ("(null)", describe("known", -7, &status));
        EXPECT_EQ(-52005, status.code);
        EXPECT_TRUE(reported(status, "\"qidynlib_symbol\":\"qixlatormgr_destroyXlator\""))
            << status.json;
        EXPECT_EQ("", manager.calls());
    }
    EXPECT_EQ(nullptr, dlopen(MANAGER_LACKING, RTLD_NOW | RTLD_NOLOAD));
}

TEST_F(SessionTest, AManagerWithoutASessionIsUnloadedAndNotAskedAgain) {
    {
        const Manager manager(MANAGER_FAILING);
        EXPECT_EQ("(null)", describe("known", -7, &status));
        EXPECT_EQ(-5, status.code);
        qierr::Status second;
        EXPECT_EQ("(null)", describe("known", -7, &second));
        EXPECT_EQ(-5, second.code);
        EXPECT_EQ("createSession;destroySession;", manager.calls());
    }
    EXPECT_EQ(nullptr, dlopen(MANAGER_FAILING, RTLD_NOW | RTLD_NOLOAD));
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
    EXPECT_EQ(&bare, qixlator_exported_create("lent", "{\"a\":1}", &status));
    EXPECT_EQ("lent {\"a\":1}", seen);
}

TEST_F(SessionTest, AnUnknownExportIsReported) {
    EXPECT_EQ(nullptr, qixlator_exported_create("qixlator_default", "{}", &status));
    EXPECT_EQ(-52005, status.code);
    EXPECT_TRUE(reported(status,
                         "\"qixlator_debug\":{\"qixlator_exported\":\"could not find xlator\","
                         "\"name\":\"qixlator_default\",\"registrationInfo\":\"{}\"}"))
        << status.json;
}

TEST_F(SessionTest, ARegistrationUnlinksItselfAtItsEnd) {
    { const TestXlator xlator("test"); }
    EXPECT_EQ(nullptr, qixlator::localRegistrations().find("test"));
    EXPECT_NE(nullptr, qixlator::localRegistrations().find("qixlator_default"));
}

// ---- The framework's allocation -----------------------------------------------------------------

TEST_F(SessionTest, ReallocReportsWantOfMemory) {
    FaultyAllocator::failAt(0, 2);
    EXPECT_EQ(nullptr, qixlator_realloc(nullptr, 8, nullptr, nullptr));
    EXPECT_EQ(nullptr, qixlator_realloc(nullptr, 8, nullptr, &status));
    FaultyAllocator::succeed();
    EXPECT_EQ(-52000, status.code);
    EXPECT_TRUE(reported(status, "\"qixlator_debug\":{\"debug\":\"realloc failed\"}"));
    EXPECT_EQ(nullptr, qixlator_realloc(nullptr, 8, nullptr, &status));
    EXPECT_EQ(0u, FaultyAllocator::requests());
}

TEST_F(SessionTest, ReallocFreesWhateverTheStatusIs) {
    const std::int64_t before = FaultyAllocator::liveBlocks();
    void* block = qixlator_realloc(nullptr, 8, nullptr, &status);
    EXPECT_NE(nullptr, block);
    status.code = -1;
    EXPECT_EQ(nullptr, qixlator_realloc(block, 0, nullptr, &status));
    EXPECT_EQ(before, FaultyAllocator::liveBlocks());
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
    EXPECT_EQ("Deutscher Text.", describeIn(2, &status));
    EXPECT_EQ("English text.", describeIn(0x300, &status));
}

TEST_F(DefaultXlatorTest, FallsBackToEnglish) {
    explain("/English", "-1", "English text.");
    EXPECT_EQ("English text.", describeIn(2, &status)) << "no directory of the language";
    explain("/German", "-2", "Anderer Text.");
    EXPECT_EQ("English text.", describeIn(2, &status)) << "no text in the language";
    EXPECT_EQ("English text.", describeIn(77, &status)) << "no such language";
    EXPECT_EQ(0, status.code);
}

TEST_F(DefaultXlatorTest, ATextOutsideTheLanguageDirectoriesServesAnyLanguage) {
    explain("/English", "-2", "Other text.");
    explain("/French", "-2", "Autre texte.");
    explain("", "-1", "Text for all.");
    EXPECT_EQ("Text for all.", describeIn(1, &status));
}

TEST_F(DefaultXlatorTest, ACodeWithoutTextIsReported) {
    explain("/English", "-2", "Other text.");
    EXPECT_EQ("(null)", describeIn(0x302, &status));
    EXPECT_EQ(-52006, status.code);
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
        EXPECT_EQ("(null)", describeIn(attributes, &failure));
        EXPECT_TRUE(reported(failure, std::string("\"lang\":0,\"ade\":") + ade + "}"))
            << failure.json;
    }
}

TEST_F(DefaultXlatorTest, MissingDirectoriesAreReportedForEnglish) {
    EXPECT_EQ("(null)", describeIn(2, &status));
    EXPECT_EQ(-52006, status.code);
    EXPECT_TRUE(reported(status, "\"debug\":\"open dir failed\",\"path\":\"" +
                                     root.locate("/usr/local/qinstal/share/errors/English") + "\""))
        << status.json;
}

}  // namespace
