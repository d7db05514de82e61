#include <limits>

#include "ServiceTest.h"
#include "support/series.h"

namespace {

constexpr std::int32_t lowest = std::numeric_limits<std::int32_t>::min();
constexpr std::int32_t highest = std::numeric_limits<std::int32_t>::max();

std::string nested(const std::string& opening, const std::string& inside,
                   const std::string& closing) {
    std::string text = inside;
    for (int depth = 0; depth < 1000; ++depth) {
        text = opening + text + closing;
    }
    return text;
}

std::string detailsFor(const std::string& translator, const std::string& value) {
    return R"({"translator":")" + translator +
           R"(","translator_info":{"ordered_data":[{"type":"usage","usage":"kUsageTypeDetails",)"
           R"("value":")" +
           value + R"(","value_type":"string"}]}})";
}

// What a driver may write into a status, and what only a broken one writes.
std::vector<std::string> statusTexts() {
    const std::string huge(1 << 20, 'x');
    const std::string info = R"({"translator":"mxlator_qitrmc","translator_info":)";
    return {
        "",
        "{}",
        R"({"file":")" + huge + "\"}",
        detailsFor("mxlator_qitrmc", "a detail"),
        detailsFor("mxlator_qitrmc", huge),
        detailsFor("mxlator_qitrmc", R"(\u0000\ud800\"\\\n)"),
        detailsFor("mxlator_another", "a detail"),
        detailsFor("mxlator_qitrmc", "\xff\xc3"),
        info + "7}",
        info + "[]}",
        info + R"({"ordered_data":{}}})",
        info + R"({"ordered_data":[1,null,[],{},{"type":5},{"usage":[]},{"usage":{}}]}})",
        info + R"({"ordered_data":[)",
        info + R"({"ordered_data":[{"type":"usage)",
        R"({"translator":5,"translator_info":{}})",
        "[]",
        R"([{"translator":"mxlator_qitrmc"}])",
        "null",
        "\"a text\"",
        "no JSON at all",
        "}",
        "{",
        "[[",
        "{\"a\":1}}",
        "{\"a\":1} and more",
        R"({"error":)" + nested("{\"nested\":", "1", "}") + "}",
        R"({"nested":)" + nested("[", "", "]") + "}",
        nested("[", "", ""),
    };
}

// A request, and the driver call within it that fails.
struct Target {
    const char* name;
    bool isReserved;  // the device is reserved by a session that is opened before
    const char* method;
    const char* params;  // null for those of the session that was opened before
    const char* driverCall;
    // The expected outcome of the request when the call fails; 0 for the code of the failure.
    std::int32_t outcome;
};

std::ostream& operator<<(std::ostream& stream, const Target& target) {
    return stream << target.name;
}

constexpr const char* open = "initializeSession";
constexpr const char* onDevice = R"({"devices":"A"})";
constexpr const char* byForce = R"({"devices":"A","force_reserve":true})";

const Target targets[] = {
    {"OpenWithoutResources", false, open, "{}", "initializeSessionWithoutResources", 0},
    {"OpenOnDevices", false, open, onDevice, "initializeSessionWithDevices", 0},
    {"OpenOnReservedDevices", true, open, onDevice, "initializeSessionWithDevices", 0},
    {"OpenOnChannels", false, open, R"({"physical_channels":"A/c"})",
     "initializeSessionWithPhysChans", 0},
    {"OpenOnAreas", false, open, R"({"nvmem_areas":"A/a"})", "initializeSessionWithNvmemAreas", 0},
    {"CloseByForce", true, open, byForce, "closeSession", 0},
    {"Close", true, "closeSession", nullptr, "closeSession", 0},
    {"Abort", true, "abortSession", nullptr, "abortSession", 0},
    // A session whose reservations cannot be read counts as holding none.
    {"FindReservedByForce", true, open, byForce, "getSessionPropertyStringArray", -250811},
    {"FindReservedForReport", true, open, onDevice, "getSessionPropertyStringArray", -250811},
};

class DriverFaultTest : public ServiceTest, public testing::WithParamInterface<Target> {
  protected:
    void openReserved() {
        if (GetParam().isReserved) {
            ASSERT_EQ(outcomesOfPost(call(open, onDevice)), Outcomes{0});
        }
    }

    Outcomes outcomesOfTarget() {
        const auto& [name, isReserved, method, params, driverCall, outcome] = GetParam();
        return outcomesOfPost(params != nullptr ? call(method, params)
                                                : callFor(method, sessions.opened()));
    }

    void expectOutcome(std::int32_t expected) {
        const Outcomes outcomes = outcomesOfTarget();
        EXPECT_TRUE(outcomes == Outcomes{expected} || lacksWords(outcomes))
            << testing::PrintToString(outcomes) << " in place of " << expected;
    }

    // The service once the driver works again.
    void expectSoundServiceOnSoundDriver() {
        sessions.answerCalls();
        sessions.warn(0, "");
        expectSoundService();
    }
};

TEST_P(DriverFaultTest, EveryKindOfDriverErrorIsReportedToTheClient) {
    int number = 0;
    for (const std::string& text : statusTexts()) {
        for (const std::int32_t code :
             {-1, -250811, -250955, -52006, -32603, -32602, -32001, -32000, lowest}) {
            if (number++ % failureStep != 0) {
                continue;
            }
            SCOPED_TRACE(std::to_string(code) + " " + text.substr(0, 100));
            openReserved();
            driver.fail(GetParam().driverCall, code, text);
            expectOutcome(GetParam().outcome != 0 ? GetParam().outcome : code);
            expectSoundServiceOnSoundDriver();
            ASSERT_FALSE(HasFailure());
        }
    }
}

TEST_P(DriverFaultTest, EveryKindOfDriverWarningIsDropped) {
    const bool isReport = std::string(GetParam().name) == "OpenOnReservedDevices" ||
                          std::string(GetParam().name) == "FindReservedForReport";
    int number = 0;
    for (const std::string& text : statusTexts()) {
        for (const std::int32_t code : {1, 250811, 250990, highest}) {
            if (number++ % failureStep != 0) {
                continue;
            }
            SCOPED_TRACE(std::to_string(code) + " " + text.substr(0, 100));
            openReserved();
            sessions.warn(code, text);
            EXPECT_EQ(outcomesOfTarget(), Outcomes{isReport ? -250811 : 0});
            expectSoundServiceOnSoundDriver();
            ASSERT_FALSE(HasFailure());
        }
    }
}

INSTANTIATE_TEST_SUITE_P(Faults, DriverFaultTest, testing::ValuesIn(targets),
                         [](const auto& info) { return info.param.name; });

class OddDriverTest : public ServiceTest {
  protected:
    // The outcomes of requests for a device reserved by a session that gives this answer.
    void expectHeldBySessionThatTells(const RecordingDriver::Reply& reply) {
        for (const char* params : {onDevice, byForce}) {
            ASSERT_EQ(outcomesOfPost(call(open, onDevice)), Outcomes{0});
            driver.reply("getSessionPropertyStringArray", reply);
            EXPECT_EQ(outcomesOfPost(call(open, params)), Outcomes{-250811});
            sessions.answerCalls();
            expectSoundService();
        }
    }
};

TEST_F(OddDriverTest, AnEmptyReservationListHoldsNoDevice) {
    RecordingDriver::Reply reply;
    expectHeldBySessionThatTells(reply);
    reply.countOfNoArray = 7;
    expectHeldBySessionThatTells(reply);
    reply.countOfNoArray = std::numeric_limits<std::uint32_t>::max();
    expectHeldBySessionThatTells(reply);
    reply.value = std::vector<std::string>{};
    expectHeldBySessionThatTells(reply);
}

TEST_F(OddDriverTest, AnArrayReturnedWithAnErrorIsFreed) {
    RecordingDriver::Reply reply;
    reply.value = std::vector<std::string>{"A", "B"};
    reply.code = -1;
    expectHeldBySessionThatTells(reply);
}

TEST_F(OddDriverTest, SessionHandle0IsAnErrorForASessionWithResources) {
    for (const char* kind : {"devices", "physical_channels", "nvmem_areas"}) {
        for (const char* function :
             {"initializeSessionWithDevices", "initializeSessionWithPhysChans",
              "initializeSessionWithNvmemAreas"}) {
            driver.give(function, std::uint64_t{0});
        }
        EXPECT_EQ(outcomesOfPost(call(open, std::string("{\"") + kind + R"(":"A/b"})")),
                  Outcomes{-250800});
        sessions.answerCalls();
        expectSoundService();
    }
}

TEST_F(OddDriverTest, SessionHandle0IsValidForASessionWithoutResources) {
    driver.give("initializeSessionWithoutResources", std::uint64_t{0});
    driver.give("closeSession(0)", {});
    EXPECT_EQ(outcomesOfPost(call(open, "{}")), Outcomes{0});
    EXPECT_EQ(outcomesOfPost(callFor("closeSession", 0)), Outcomes{0});
    EXPECT_EQ(outcomesOfPost(callFor("closeSession", 0)), Outcomes{-250833});
    sessions.answerCalls();
    expectSoundService();
}

TEST_F(OddDriverTest, AHandleIssuedTwiceIsOneSession) {
    driver.give("initializeSessionWithoutResources", std::uint64_t{4294967295});
    driver.give("closeSession(4294967295)", {});
    EXPECT_EQ(outcomesOfPost(call(open, "{}")), Outcomes{0});
    EXPECT_EQ(outcomesOfPost(call(open, "{}")), Outcomes{0});
    const std::string close =
        call("closeSession", R"({"session_id":"_session18446744073709551615"})");
    EXPECT_EQ(outcomesOfPost(close), Outcomes{0});
    EXPECT_EQ(outcomesOfPost(close), Outcomes{-250833});
    sessions.answerCalls();
    expectSoundService();
}

TEST_F(OddDriverTest, UnknownEnumerationValuesArePassedOn) {
    for (const std::int32_t value : {lowest, -1, 0, 77, highest}) {
        driver.give("translateStaticEnumStringToValue", std::int64_t{value});
        driver.give("translateStaticEnumStringToValue(\"ReservationAccess\", \"ReadOnly\")",
                    std::int64_t{value});
        driver.takeCalls();
        EXPECT_EQ(outcomesOfPost(call(open, R"({"devices":"A","access":"ReadOnly"})")),
                  Outcomes{0});
        EXPECT_EQ(driver.takeCalls().back(), "initializeSessionWithDevices(\"A\", 60, " +
                                                 std::to_string(value) + ", \"\", 0)");
        sessions.answerCalls();
        expectSoundService();
    }
}

}  // namespace
