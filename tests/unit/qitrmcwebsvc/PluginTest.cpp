#include <cstdlib>
#include <exception>
#include <filesystem>
#include <fstream>
#include <string>

#include "support/DriverTest.h"
#include "support/FakeWebRuntime.h"
#include "support/PlainDescriptions.h"
#include "support/TestRoot.h"

extern "C" {
void qitrmcInit();
void qitrmcPause();
void qitrmcResume();
void qitrmcFinalize();
void qitrmcRun(ws_Entry* entry, ws_Request* request);
}

namespace {

using Lines = std::vector<std::string>;

const Lines disabled = {"code 404",
                        "write QI-TRMC web server is disabled. Please enable it in QI-DESK."};

class PluginTest : public DriverTest {
  protected:
    void SetUp() override {
        DriverTest::SetUp();
        driver.give("initializeSessionWithoutResources", std::uint64_t{1});
    }
    void TearDown() override {
        qitrmcFinalize();
        removeConfiguration();
        qitrmcInit();  // back to a disabled service
        DriverTest::TearDown();
    }

    void initialise(const std::string& configuration) {
        root.write("/etc/qinstal/share/qitrmc.ini", configuration);
        qitrmcInit();
    }
    void initialiseEnabled() { initialise("[WebService]\nEnable=1\n"); }
    void removeConfiguration() { root.remove("/etc/qinstal/share/qitrmc.ini"); }

    Lines run() {
        qitrmcRun(&entry, &request);
        return std::exchange(request.done, {});
    }
    bool isServed() { return run() != disabled; }

    static Lines served(const std::string& response) {
        return {"type application/json; charset=utf-8", "write " + response};
    }

    TestRoot root;
    FakeEntry entry{U"Call"};
    ws_Request request;
    const std::string refusedRoot =
        "{\"jsonrpc\":\"2.0\",\"id\":null,\"error\":{\"code\":-32600,\"message\":\"-32600\"}}";
};

TEST_F(PluginTest, IsDisabledBeforeItIsInitialised) {
    request.variables.clear();
    EXPECT_EQ(run(), disabled);
}

TEST_F(PluginTest, IsDisabledWithoutAPositiveSetting) {
    for (const char* configuration :
         {"", "[WebService]\n", "[WebService]\nEnable=\n", "[WebService]\nEnable=0\n",
          "[WebService]\nEnable=True\n", "[WebService]\nEnable=-1\n", "[Other]\nEnable=1\n",
          "[WebService]\nEnable=4294967296\n", "[WebService]\nEnabled=1\n"}) {
        initialise(configuration);
        EXPECT_FALSE(isServed()) << configuration;
    }
    removeConfiguration();
    qitrmcInit();
    EXPECT_FALSE(isServed());
}

TEST_F(PluginTest, IsEnabledByAnyPositiveSetting) {
    for (const char* configuration :
         {"[WebService]\nEnable=1\n", "[WebService]\nEnable = 7 \n", "[webservice]\nENABLE=1",
          "[WebService]\nEnable=\"1\"\n", "\xef\xbb\xbf[WebService]\r\nEnable=1\r\n",
          "[WebService]\nEnable=4294967295\n"}) {
        initialise(configuration);
        EXPECT_TRUE(isServed()) << configuration;
    }
}

TEST_F(PluginTest, ServesARequest) {
    initialiseEnabled();
    request.body = "{\"jsonrpc\":\"2.0\",\"id\":1,\"method\":\"initializeSession\"}";
    EXPECT_EQ(run(), served("{\"jsonrpc\":\"2.0\",\"id\":1,\"result\":{\"session_id\":"
                            "\"_session1\"}}"));
}

TEST_F(PluginTest, KeepsServingWhilePaused) {
    initialiseEnabled();
    request.body = "1";
    qitrmcPause();
    EXPECT_EQ(run(), served(refusedRoot));
    qitrmcResume();
    EXPECT_EQ(run(), served(refusedRoot));
}

TEST_F(PluginTest, AnswersAnEmptyBodyWithAnError) {
    initialiseEnabled();
    EXPECT_EQ(run(), served("{\"jsonrpc\":\"2.0\",\"id\":null,\"error\":{\"code\":-32700,"
                            "\"message\":\"-32700 kUsageTypeDetails=The document is empty. "
                            "kUsageTypeOffset=0\"}}"));
}

TEST_F(PluginTest, ReadsALongVariableWithABufferOfTheReportedSize) {
    initialiseEnabled();
    const std::vector<std::uint32_t> once = {32, 32};
    request.variables["REQUEST_METHOD"] = std::string(32, 'x');
    run();
    EXPECT_EQ(request.variableBufferSizes, once);
    request.variableBufferSizes.clear();
    request.variables["REQUEST_METHOD"] = std::string(33, 'x');
    run();
    EXPECT_EQ(request.variableBufferSizes, (std::vector<std::uint32_t>{32, 32, 33}));
}

TEST_F(PluginTest, ReadsALongBodyWithABufferOfTheReportedSize) {
    initialiseEnabled();
    for (std::size_t length : {255, 256, 257, 5000}) {
        request.body = std::string(length - 1, ' ') + "1";
        request.bodyBufferSizes.clear();
        EXPECT_EQ(run(), served(refusedRoot)) << length;
        const std::vector<std::uint32_t> once = {256};
        const std::vector<std::uint32_t> twice = {256, static_cast<std::uint32_t>(length)};
        EXPECT_EQ(request.bodyBufferSizes, length > 256 ? twice : once);
    }
}

TEST_F(PluginTest, CutsABodyAtItsFirstNul) {
    initialiseEnabled();
    request.body = std::string("1\0 garbage", 10);
    EXPECT_EQ(run(), served(refusedRoot));
    request.body += std::string(300, 'x');
    EXPECT_EQ(run(), served(refusedRoot));
}

TEST_F(PluginTest, RefusesOtherTransportsBeforeItChecksTheMethod) {
    initialiseEnabled();
    const Lines refused = {"code 404", "write Only HTTP protocol is supported."};
    request.variables["REQUEST_METHOD"] = "GET";
    for (const char* transport : {"https", "HTTP", "http ", ""}) {
        request.variables["REQUEST_TRANSPORT"] = transport;
        EXPECT_EQ(run(), refused) << transport;
    }
    request.variables.erase("REQUEST_TRANSPORT");
    EXPECT_EQ(run(), refused);
}

TEST_F(PluginTest, RefusesOtherMethodsBeforeItChecksTheEntry) {
    initialiseEnabled();
    const Lines refused = {"code 404", "write Only HTTP POST request is supported."};
    entry.name = U"Other";
    request.body = "1";
    for (const char* method :
         {"GET", "post", "POSTX", "", "a method whose name is longer than the first buffer"}) {
        request.variables["REQUEST_METHOD"] = method;
        EXPECT_EQ(run(), refused) << method;
    }
    request.variables.erase("REQUEST_METHOD");
    EXPECT_EQ(run(), refused);
}

TEST_F(PluginTest, ServesTheEntryInAnyCaseAndNoOther) {
    initialiseEnabled();
    request.body = "1";
    for (const char32_t* name : {U"Call", U"CALL", U"call", U"cAlL"}) {
        entry.name = name;
        EXPECT_EQ(run(), served(refusedRoot));
    }
    request.bodyReadable = false;
    for (const char32_t* name : {U"", U"Cal", U"Calls", U" Call", U"C\u00e4ll"}) {
        entry.name = name;
        EXPECT_EQ(run(), Lines{"code 404"});
    }
}

TEST_F(PluginTest, AnswersAnUnreadableBodyWithAStatusCodeOnly) {
    initialiseEnabled();
    request.bodyReadable = false;
    EXPECT_EQ(run(), Lines{"code 400"});
    request.bodyReadable = true;
    request.bodyFailsForGood = true;
    request.body = std::string(300, ' ');
    request.bodyBufferSizes.clear();
    EXPECT_EQ(run(), Lines{"code 400"});
}

TEST_F(PluginTest, AnswersAnErrorThatCannotBeDescribedWithAStatusCodeOnly) {
    initialiseEnabled();
    request.body = "1";
    plainDescriptions::failNext(1);
    EXPECT_EQ(run(), Lines{"code 500"});
    EXPECT_EQ(run(), served(refusedRoot));
}

TEST_F(PluginTest, LetsAnExceptionThatIsNotAStdExceptionReachTheServer) {
    constexpr ws_EntryOperations throwing = {nullptr, nullptr, nullptr,
                                             [](const ws_Entry*) -> ws_WideString { throw 5; }};
    initialiseEnabled();
    entry.operations = &throwing;
    EXPECT_THROW(qitrmcRun(&entry, &request), int);
    EXPECT_EQ(request.done, Lines{});
}

TEST_F(PluginTest, AnswersWithAStatusCodeOnlyWhenItIsEnabledButHasNoHandler) {
    initialiseEnabled();
    qitrmcFinalize();
    EXPECT_EQ(run(), Lines{"code 500"});
}

TEST_F(PluginTest, ReplacesItsHandlerAndAllSessionsWhenInitialisedAgain) {
    initialiseEnabled();
    request.body = "{\"jsonrpc\":\"2.0\",\"id\":1,\"method\":\"initializeSession\"}";
    run();
    driver.takeCalls();
    qitrmcInit();
    EXPECT_EQ(driver.takeCalls(), Calls{"closeSession(1)"});
}

TEST_F(PluginTest, KeepsItsHandlerWhenDisabledUntilFinalised) {
    initialiseEnabled();
    request.body = "{\"jsonrpc\":\"2.0\",\"id\":1,\"method\":\"initializeSession\"}";
    run();
    driver.takeCalls();
    initialise("[WebService]\nEnable=0\n");
    EXPECT_FALSE(isServed());
    EXPECT_EQ(driver.takeCalls(), Calls{});
    qitrmcFinalize();
    EXPECT_EQ(driver.takeCalls(), Calls{"closeSession(1)"});
}

}  // namespace
