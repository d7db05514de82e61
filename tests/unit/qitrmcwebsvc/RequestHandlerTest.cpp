#include "qitrmcwebsvc/RequestHandler.h"

#include <cmath>
#include <limits>
#include <memory>
#include <string>

#include "support/DriverTest.h"
#include "support/PlainDescriptions.h"

using nQITRMCWEBSVC100::RequestHandler;

namespace {

class RequestHandlerTest : public DriverTest {
  protected:
    void SetUp() override {
        DriverTest::SetUp();
        driver.give("initializeSessionWithoutResources", std::uint64_t{1});
        handler = std::make_unique<RequestHandler>();
    }
    void TearDown() override {
        handler.reset();
        DriverTest::TearDown();
    }

    std::string answer(const std::string& body) { return handler->handleRequest(body); }

    // A response with a JSON-RPC error code, whose text shows code and details.
    static std::string refusal(const std::string& id, const std::string& code,
                               const std::string& details) {
        return "{\"jsonrpc\":\"2.0\",\"id\":" + id + ",\"error\":{\"code\":" + code +
               ",\"message\":\"" + code + details + "\"}}";
    }
    static std::string invalid(const std::string& id, const std::string& member) {
        return refusal(id, "-32600", " kUsageTypeInvalidMember=" + member);
    }
    static std::string wrapped(const std::string& id, const std::string& code,
                               const std::string& details) {
        return "{\"jsonrpc\":\"2.0\",\"id\":" + id +
               ",\"error\":{\"code\":-32000,\"message\":\"-32000\",\"data\":{\"qitrmc_code\":" +
               code + ",\"qitrmc_message\":\"" + code + details + "\"}}}";
    }
    static std::string opened(const std::string& id, const std::string& session) {
        return "{\"jsonrpc\":\"2.0\",\"id\":" + id + ",\"result\":{\"session_id\":\"" + session +
               "\"}}";
    }

    const std::string open = "{\"jsonrpc\":\"2.0\",\"id\":1,\"method\":\"initializeSession\"}";
    std::unique_ptr<RequestHandler> handler;
};

TEST_F(RequestHandlerTest, AnswersASingleRequest) {
    EXPECT_EQ(answer(open), opened("1", "_session1"));
}

TEST_F(RequestHandlerTest, ReportsABodyThatIsNotJson) {
    EXPECT_EQ(answer(""), refusal("null", "-32700",
                                  " kUsageTypeDetails=The document is empty. kUsageTypeOffset=0"));
    EXPECT_EQ(answer(open + "x"),
              refusal("null", "-32700",
                      " kUsageTypeDetails=The document root must not be followed by other values."
                      " kUsageTypeOffset=" +
                          std::to_string(open.size())));
}

TEST_F(RequestHandlerTest, RefusesRootsThatAreNotRequests) {
    for (const char* root : {"1", "\"text\"", "true", "null", "[]"}) {
        EXPECT_EQ(answer(root), refusal("null", "-32600", "")) << root;
    }
}

TEST_F(RequestHandlerTest, ChecksTheIdFirst) {
    EXPECT_EQ(answer("{}"), invalid("null", "id"));
    EXPECT_EQ(answer("{\"jsonrpc\":1,\"method\":2,\"params\":3}"), invalid("null", "id"));
}

TEST_F(RequestHandlerTest, EchoesAnIdOfTheWrongType) {
    for (const char* id : {"2147483648", "-2147483649", "1.5", "1.0", "null", "true", "{\"a\":[1]}",
                           "[1,\"x\"]", "18446744073709551615"}) {
        EXPECT_EQ(answer(std::string("{\"jsonrpc\":\"2.0\",\"method\":\"m\",\"id\":") + id + "}"),
                  invalid(id, "id"));
    }
}

TEST_F(RequestHandlerTest, EchoesLongTextsInIds) {
    const std::string text = "\"" + std::string(100000, 'x') + "\\n\"";
    const std::string wrong = "{" + text + ":[" + text + "," + text + "]}";
    EXPECT_EQ(answer("{\"jsonrpc\":\"2.0\",\"method\":\"\",\"id\":" + text + "}"),
              refusal(text, "-32601", " kUsageTypeMethod="));
    EXPECT_EQ(answer("{\"jsonrpc\":\"2.0\",\"method\":\"m\",\"id\":" + wrong + "}"),
              invalid(wrong, "id"));
}

TEST_F(RequestHandlerTest, AcceptsIdsOfTheSigned32BitRangeAndTexts) {
    for (const char* id : {"2147483647", "-2147483648", "0", "\"\"", "\"a\\\"b\\u0001\""}) {
        EXPECT_EQ(answer(std::string("{\"jsonrpc\":\"2.0\",\"method\":\"\",\"id\":") + id + "}"),
                  refusal(id, "-32601", " kUsageTypeMethod="));
    }
}

TEST_F(RequestHandlerTest, ChecksTheProtocolVersionBeforeTheMethod) {
    for (const char* version : {"", "\"jsonrpc\":2.0,", "\"jsonrpc\":\"1.0\","}) {
        EXPECT_EQ(answer(std::string("{") + version + "\"id\":7,\"method\":5}"),
                  invalid("7", "jsonrpc"));
    }
    EXPECT_EQ(answer("{\"jsonrpc\":\"2.0\",\"id\":7,\"method\":5}"), invalid("7", "method"));
    EXPECT_EQ(answer("{\"jsonrpc\":\"2.0\",\"id\":7}"), invalid("7", "method"));
}

TEST_F(RequestHandlerTest, FindsMethodsByTheirExactNameOnly) {
    for (const char* method : {"InitializeSession", "initializesession", " initializeSession",
                               "initializeSession ", "getChassisIpOrHostname"}) {
        EXPECT_EQ(answer(std::string("{\"jsonrpc\":\"2.0\",\"id\":1,\"params\":5,\"method\":\"") +
                         method + "\"}"),
                  refusal("1", "-32601", std::string(" kUsageTypeMethod=") + method));
    }
}

TEST_F(RequestHandlerTest, RefusesParamsThatAreNotAnObject) {
    EXPECT_EQ(
        answer("{\"jsonrpc\":\"2.0\",\"id\":1,\"method\":\"initializeSession\",\"params\":[]}"),
        invalid("1", "params"));
}

TEST_F(RequestHandlerTest, PassesMissingParamsToTheProcedureAsAnEmptyObject) {
    EXPECT_EQ(answer("{\"jsonrpc\":\"2.0\",\"id\":1,\"method\":\"closeSession\"}"),
              refusal("1", "-32602",
                      " kUsageTypeParameter=#/params kUsageTypeDetails=The following parameter(s)"
                      " is required: session_id."));
}

TEST_F(RequestHandlerTest, WrapsFailuresOfTheServiceAndTheDriver) {
    EXPECT_EQ(answer("{\"jsonrpc\":\"2.0\",\"id\":\"x\",\"method\":\"closeSession\","
                     "\"params\":{\"session_id\":\"_session5\"}}"),
              wrapped("\"x\"", "-250833", " kUsageTypeSessionId=_session5"));
    driver.fail("initializeSessionWithoutResources", -99);
    EXPECT_EQ(answer(open), wrapped("1", "-99", ""));
    driver.fail("initializeSessionWithoutResources", -32000);
    EXPECT_EQ(answer(open), refusal("1", "-32000", ""));
}

TEST_F(RequestHandlerTest, StopsABatchAtItsFirstFailure) {
    EXPECT_EQ(answer("[" + open + ",{\"jsonrpc\":\"2.0\",\"id\":2,\"method\":\"x\"}," +
                     "{\"jsonrpc\":\"2.0\",\"id\":[3],\"method\":\"closeSession\"},4]"),
              "[" + opened("1", "_session1") + "," + refusal("2", "-32601", " kUsageTypeMethod=x") +
                  "," + wrapped("[3]", "-32001", "") + "," + wrapped("null", "-32001", "") + "]");
    EXPECT_EQ(driver.takeCalls(), Calls{"initializeSessionWithoutResources()"});
}

TEST_F(RequestHandlerTest, StopsABatchAtAnEnvelopeFaultToo) {
    EXPECT_EQ(answer("[{\"jsonrpc\":\"2.0\",\"id\":1}," + open + "]"),
              "[" + invalid("1", "method") + "," + wrapped("1", "-32001", "") + "]");
    EXPECT_EQ(answer("[7," + open + "]"),
              "[" + refusal("null", "-32600", "") + "," + wrapped("1", "-32001", "") + "]");
    EXPECT_EQ(answer("[[" + open + "]]"), "[" + refusal("null", "-32600", "") + "]");
    EXPECT_EQ(driver.takeCalls(), Calls{});
}

TEST_F(RequestHandlerTest, DescribesAllSkippedElementsOnce) {
    std::string body = "[{}";
    std::string expected = "[" + invalid("null", "id");
    for (int id = 0; id < 50; ++id) {
        body += ",{\"id\":" + std::to_string(id) + "}";
        expected += "," + wrapped(std::to_string(id), "-32001", "");
    }
    plainDescriptions::failNext(1, 3);  // one for the first element, two for all the others
    EXPECT_EQ(answer(body + "]"), expected + "]");
    plainDescriptions::failNext(0);
}

TEST_F(RequestHandlerTest, RefusesABatchThatIsTooLongAsAWhole) {
    std::string body = "[1";
    for (int element = 1; element < 100000; ++element) {
        body += ",1";
    }
    EXPECT_EQ(answer(body + "]").substr(0, 60),
              ("[" + refusal("null", "-32600", "")).substr(0, 60));
    EXPECT_EQ(answer(body + ",1]"), refusal("null", "-32600", ""));
}

TEST_F(RequestHandlerTest, AnswersABatchOfOneWithAnArray) {
    EXPECT_EQ(answer("[" + open + "]"), "[" + opened("1", "_session1") + "]");
}

TEST_F(RequestHandlerTest, ServesTheNextRequestAfterAFailure) {
    answer("[5]");
    answer("{}");
    EXPECT_EQ(answer("[" + open + "]"), "[" + opened("1", "_session1") + "]");
    EXPECT_EQ(answer(open), opened("1", "_session1"));
}

TEST_F(RequestHandlerTest, AnswersOnceForAllWhenAFailureCannotBeDescribed) {
    plainDescriptions::failNext(1);
    EXPECT_EQ(answer("[" + open + ",{},{}]"), wrapped("null", "-52006", ""));
    EXPECT_EQ(answer(open), opened("1", "_session1"));
}

TEST_F(RequestHandlerTest, ThrowsWhenThatFailureCannotBeDescribedEither) {
    plainDescriptions::failNext(2);
    EXPECT_THROW(answer("{}"), std::exception);
    EXPECT_EQ(answer(open), opened("1", "_session1"));
}

TEST_F(RequestHandlerTest, PrintsNumbersThatJsonCannotRepresentAsNull) {
    answer(open);
    driver.give("getSystemPropertyStringArray(1, \"Sys.Devices\")", Calls{"A"});
    driver.give("openGenericProperty", std::uint64_t{8});
    driver.give("getPropertyPropertyInt32", std::int64_t{9});
    driver.give("translateStaticEnumValueToString", std::string("DoubleArray"));
    const double infinity = std::numeric_limits<double>::infinity();
    driver.give("getGenericPropertyDoubleArray",
                std::vector<double>{0.5, infinity, -infinity, std::nan("")});
    EXPECT_EQ(answer("{\"jsonrpc\":\"2.0\",\"id\":1,\"method\":\"getProperty\",\"params\":{"
                     "\"session_id\":\"_session1\",\"property\":\"P\",\"devices\":\"A\"}}"),
              "{\"jsonrpc\":\"2.0\",\"id\":1,\"result\":{\"data_type\":\"DoubleArray\","
              "\"value\":[0.5,null,null,null]}}");
}

TEST_F(RequestHandlerTest, ClosesItsSessionsAtItsEnd) {
    answer(open);
    driver.takeCalls();
    handler.reset();
    EXPECT_EQ(driver.takeCalls(), Calls{"closeSession(1)"});
}

}  // namespace
