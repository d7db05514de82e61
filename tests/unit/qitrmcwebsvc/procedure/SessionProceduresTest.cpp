#include <memory>
#include <string>

#include "qitrmcwebsvc/RequestHandler.h"
#include "support/DriverTest.h"

using nQITRMCWEBSVC100::RequestHandler;

namespace {

class SessionProceduresTest : public DriverTest {
  protected:
    void SetUp() override {
        DriverTest::SetUp();
        driver.give("initializeSessionWithoutResources", std::uint64_t{1});
        driver.give("initializeSessionWithDevices", std::uint64_t{2});
        driver.give("initializeSessionWithPhysChans", std::uint64_t{3});
        driver.give("initializeSessionWithNvmemAreas", std::uint64_t{4});
        driver.give("translateStaticEnumStringToValue(\"ReservationAccess\", \"ReadOnly\")",
                    std::int64_t{1});
        driver.give("translateStaticEnumStringToValue(\"ReservationAccess\", \"ReadWrite\")",
                    std::int64_t{3});
        handler = std::make_unique<RequestHandler>();
    }
    void TearDown() override {
        handler.reset();
        DriverTest::TearDown();
    }

    // The part of the response after the envelope.
    std::string answer(const std::string& method, const std::string& params) {
        const std::string response =
            handler->handleRequest("{\"jsonrpc\":\"2.0\",\"id\":0,\"method\":\"" + method +
                                   "\",\"params\":" + params + "}");
        const std::string envelope = "{\"jsonrpc\":\"2.0\",\"id\":0,";
        EXPECT_EQ(response.substr(0, envelope.size()), envelope);
        return response.substr(envelope.size());
    }

    static std::string opened(const std::string& id) {
        return "\"result\":{\"session_id\":\"" + id + "\"}}";
    }
    static std::string wrapped(const std::string& code, const std::string& details) {
        return "\"error\":{\"code\":-32000,\"message\":\"-32000\",\"data\":{\"qitrmc_code\":" +
               code + ",\"qitrmc_message\":\"" + code + details + "\"}}}";
    }

    const std::string done = "\"result\":{}}";
    std::unique_ptr<RequestHandler> handler;
};

TEST_F(SessionProceduresTest, OpensASessionWithoutResources) {
    EXPECT_EQ(answer("initializeSession", "{}"), opened("_session1"));
    EXPECT_EQ(driver.takeCalls(), Calls{"initializeSessionWithoutResources()"});
}

TEST_F(SessionProceduresTest, ReservesNothingWithoutResources) {
    EXPECT_EQ(answer("initializeSession",
                     "{\"access\":1,\"reservation_group\":\"g\","
                     "\"reservation_timeout\":5,\"force_reserve\":true}"),
              opened("_session1"));
    EXPECT_EQ(driver.takeCalls(), Calls{"initializeSessionWithoutResources()"});
}

TEST_F(SessionProceduresTest, OpensOnEachKindWithTheDefaults) {
    EXPECT_EQ(answer("initializeSession", "{\"devices\":[\"A\",\"B\"]}"), opened("_session2"));
    EXPECT_EQ(answer("initializeSession", "{\"physical_channels\":\"A/ch0:1\"}"),
              opened("_session3"));
    EXPECT_EQ(answer("initializeSession", "{\"nvmem_areas\":\"A/user\"}"), opened("_session4"));
    EXPECT_EQ(driver.takeCalls(),
              (Calls{"initializeSessionWithDevices(\"A,B\", 60, 3, \"\", 0)",
                     "initializeSessionWithPhysChans(\"A/ch0:1\", 60, 3, \"\", 0)",
                     "initializeSessionWithNvmemAreas(\"A/user\", 60, 3, \"\", 0)"}));
}

TEST_F(SessionProceduresTest, PassesTheReservationParametersOn) {
    answer("initializeSession",
           "{\"devices\":\"A\",\"access\":1,\"reservation_group\":\"g h\","
           "\"reservation_timeout\":2,\"force_reserve\":false}");
    answer("initializeSession", "{\"devices\":\"A\",\"reservation_timeout\":-0.5}");
    EXPECT_EQ(driver.takeCalls(),
              (Calls{"initializeSessionWithDevices(\"A\", 60, 1, \"g h\", 2)",
                     "initializeSessionWithDevices(\"A\", 60, 3, \"\", -0.5)"}));
}

TEST_F(SessionProceduresTest, ReadsTheAccessAsNumberOrWord) {
    answer("initializeSession", "{\"devices\":\"A\",\"access\":3}");
    answer("initializeSession", "{\"devices\":\"A\",\"access\":\"ReadOnly\"}");
    answer("initializeSession", "{\"devices\":\"A\",\"access\":\"ReadWrite\"}");
    EXPECT_EQ(driver.takeCalls(),
              (Calls{"initializeSessionWithDevices(\"A\", 60, 3, \"\", 0)",
                     "translateStaticEnumStringToValue(\"ReservationAccess\", \"ReadOnly\")",
                     "initializeSessionWithDevices(\"A\", 60, 1, \"\", 0)",
                     "translateStaticEnumStringToValue(\"ReservationAccess\", \"ReadWrite\")",
                     "initializeSessionWithDevices(\"A\", 60, 3, \"\", 0)"}));
}

TEST_F(SessionProceduresTest, ReportsAnAccessWithAFractionAsAnInternalError) {
    EXPECT_EQ(answer("initializeSession", "{\"devices\":\"A\",\"access\":1.0}"),
              wrapped("-250800", " comment=Fail to parse enum type."));
}

TEST_F(SessionProceduresTest, DisplacesOnlyWhenForced) {
    answer("initializeSession", "{\"devices\":\"A\"}");
    driver.give("getSessionPropertyStringArray(2, \"Session.ReservedDevices\")", Calls{"A"});
    driver.give("initializeSessionWithDevices", std::uint64_t{5});
    driver.takeCalls();
    EXPECT_EQ(answer("initializeSession", "{\"devices\":\"A\",\"force_reserve\":true}"),
              opened("_session5"));
    EXPECT_EQ(driver.takeCalls(),
              (Calls{"getSessionPropertyStringArray(2, \"Session.ReservedDevices\")",
                     "freeStringArray(1)", "closeSession(2)",
                     "initializeSessionWithDevices(\"A\", 60, 3, \"\", 0)"}));
}

TEST_F(SessionProceduresTest, ClosesASession) {
    answer("initializeSession", "{}");
    driver.takeCalls();
    EXPECT_EQ(answer("closeSession", "{\"session_id\":\"_session1\"}"), done);
    EXPECT_EQ(driver.takeCalls(), Calls{"closeSession(1)"});
    EXPECT_EQ(answer("closeSession", "{\"session_id\":\"_session1\"}"),
              wrapped("-250833", " kUsageTypeSessionId=_session1"));
}

TEST_F(SessionProceduresTest, KeepsASessionOpenAfterItsAbort) {
    answer("initializeSession", "{}");
    driver.takeCalls();
    EXPECT_EQ(answer("abortSession", "{\"session_id\":\"_session1\"}"), done);
    EXPECT_EQ(answer("abortSession", "{\"session_id\":\"_session1\"}"), done);
    EXPECT_EQ(driver.takeCalls(), (Calls{"abortSession(1)", "abortSession(1)"}));
    EXPECT_EQ(answer("closeSession", "{\"session_id\":\"_session1\"}"), done);
    EXPECT_EQ(answer("abortSession", "{\"session_id\":\"_session1\"}"),
              wrapped("-250833", " kUsageTypeSessionId=_session1"));
}

TEST_F(SessionProceduresTest, PassesTheDriversErrorOn) {
    answer("initializeSession", "{}");
    driver.fail("abortSession", -41);
    EXPECT_EQ(answer("abortSession", "{\"session_id\":\"_session1\"}"), wrapped("-41", ""));
}

TEST_F(SessionProceduresTest, DoesNotAcceptAnIdFollowedByANul) {
    answer("initializeSession", "{}");
    EXPECT_EQ(answer("closeSession", "{\"session_id\":\"_session1\\u0000x\"}"),
              wrapped("-250833", " kUsageTypeSessionId=_session1"));
}

}  // namespace
