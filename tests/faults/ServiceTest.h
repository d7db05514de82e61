#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "support/DriverTest.h"
#include "support/FakeWebRuntime.h"
#include "support/ModelledSessions.h"
#include "support/TestPaths.h"
#include "support/TestRoot.h"
#include "support/responseFault.h"

extern "C" {
void qitrmcInit();
void qitrmcFinalize();
void qitrmcRun(ws_Entry* entry, ws_Request* request);
}

// The base of tests that inject faults into the whole plug-in: the plug-in is enabled and runs on
// a driver that keeps sessions. At the end no session may be left in the driver, and no call may
// have been made for a session that was not open.
class ServiceTest : public DriverTest {
  protected:
    using Lines = std::vector<std::string>;
    using Outcomes = std::vector<std::int32_t>;

    // Stands for an HTTP error status among the outcomes.
    static constexpr std::int32_t httpServerError = 500;
    static constexpr std::int32_t outOfMemory = -250801;
    static constexpr std::int32_t skipped = -32001;

    void SetUp() override {
        DriverTest::SetUp();
        sessions.answerCalls();
        root.showDirectory("/usr/local/qinstal/share", explanationFiles);
        root.write("/etc/qinstal/share/qitrmc.ini", "[WebService]\nEnable=1\n");
        qitrmcInit();
    }
    void TearDown() override {
        sessions.answerCalls();
        qitrmcFinalize();
        EXPECT_EQ(sessions.open(), std::vector<ModelledSessions::Handle>{});
        EXPECT_EQ(sessions.callsForClosedSessions(), 0);
        DriverTest::TearDown();
    }

    // Whether a request failed because its failure could not be described: because memory ran out,
    // because of a fault in a status, or because there is no text for the code.
    static bool lacksWords(const Outcomes& outcomes) {
        for (const std::int32_t code : {-52000, -52003, -52005, -52006}) {
            if (QITRMC_WORDS_MAY_FAIL && outcomes == Outcomes{code}) {
                return true;
            }
        }
        return false;
    }

    static std::string call(const std::string& method, const std::string& params) {
        return R"({"jsonrpc":"2.0","id":1,"method":")" + method + R"(","params":)" + params + "}";
    }
    static std::string callFor(const std::string& method, ModelledSessions::Handle session) {
        return call(method, R"({"session_id":"_session)" + std::to_string(session) + "\"}");
    }

    // What the plug-in did to answer a body.
    Lines post(const std::string& body) {
        ws_Request request;
        request.body = body;
        qitrmcRun(&entry, &request);
        return request.done;
    }

    // How a body was answered, once it is certain that the response is either complete or absent.
    static Outcomes outcomesOf(const Lines& done) {
        if (done == Lines{"code 500"}) {
            return {httpServerError};
        }
        const std::string write = "write ";
        EXPECT_EQ(done.size(), 2u);
        EXPECT_EQ(done.front(), "type application/json; charset=utf-8");
        EXPECT_EQ(done.back().substr(0, write.size()), write);
        const std::string text = done.back().substr(write.size());
        const std::string fault = responseFault(text);
        EXPECT_EQ(fault, "") << text;
        return fault.empty() ? outcomesIn(text) : Outcomes{};
    }
    Outcomes outcomesOfPost(const std::string& body) { return outcomesOf(post(body)); }

    // Checks that the service works as before: the access lock is free for either kind of request,
    // all that the driver lent is freed, and each session of the driver can be closed by its id.
    void expectSoundService() {
        EXPECT_EQ(driver.outstanding(), 0);
        EXPECT_EQ(outcomesOfPost("[" + call("initializeSession", "{}") + "]"), Outcomes{0});
        for (const ModelledSessions::Handle session : sessions.open()) {
            EXPECT_EQ(outcomesOfPost(callFor("closeSession", session)), Outcomes{0});
        }
        EXPECT_EQ(sessions.open(), std::vector<ModelledSessions::Handle>{});
        driver.takeCalls();
    }

    ModelledSessions sessions;
    TestRoot root;
    FakeEntry entry{U"Call"};
};
