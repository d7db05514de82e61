#include <fstream>
#include <regex>
#include <sstream>
#include <thread>

#include "ChassisFile.h"
#include "Driver.h"

using namespace drivertest;

namespace {

// The trace file of this process. It is named before the first call of the driver.
const std::string& tracePath() {
    static const ChassisFile file("");
    return file.path;
}

class TraceTest : public testing::Test {
  protected:
    static void SetUpTestSuite() { setenv("QITRMC_SIM_TRACE", tracePath().c_str(), 1); }

    void SetUp() override { linesBefore = allLines().size(); }

    // The lines since the beginning of the test, without the times.
    Names lines() const {
        const Names all = allLines();
        Names fresh;
        for (std::size_t i = linesBefore; i < all.size(); ++i) {
            std::smatch parts;
            const std::regex form(R"(\d+\.\d{6} t\d+ (.*) \[\d+ us\])");
            EXPECT_TRUE(std::regex_match(all[i], parts, form)) << all[i];
            fresh.push_back(parts[1]);
        }
        return fresh;
    }

    static Names allLines() {
        std::ifstream file(tracePath());
        Names lines;
        for (std::string line; std::getline(file, line);) {
            lines.push_back(line);
        }
        return lines;
    }

  private:
    std::size_t linesBefore = 0;
};

std::string handleText(const Session& session) {
    return std::to_string(session.handle);
}

TEST_F(TraceTest, ACallIsTracedWithItsArgumentsAndOutputs) {
    const Session session("Mod1", 3, "group");
    Status status;
    double value = 0.0;
    nQITRMCAPI100_getGenericPropertyDouble(session, "Mod1", "DMM.Range", &value, &status);
    const std::string handle = handleText(session);
    EXPECT_EQ(lines(),
              (Names{"initializeSessionWithDevices(devices=\"Mod1\", timeout=60, access=3, "
                     "reservationGroup=\"group\", reservationTimeout=0) -> 0 session=" +
                         handle,
                     "getGenericPropertyDouble(session=" + handle +
                         ", resources=\"Mod1\", property=\"DMM.Range\") -> 0 value=10"}));
}

TEST_F(TraceTest, AFailureIsTracedWithItsDetailsAndWithoutOutputs) {
    const Session session;
    Status status;
    char* text = nullptr;
    nQITRMCAPI100_getGenericPropertyString(session, "Mod9", "A", &text, &status);
    EXPECT_EQ(lines().back(), "getGenericPropertyString(session=" + handleText(session) +
                                  ", resources=\"Mod9\", property=\"A\") -> -250956 " +
                                  detailsOf("unknownDevice", usage("RequestedValue", "\"Mod9\"")));
}

TEST_F(TraceTest, ACallWithANegativeStatusIsNotTraced) {
    Status status;
    status.code = -1;
    nQITRMCAPI100_closeSession(1, &status);
    EXPECT_EQ(lines(), Names{});
}

TEST_F(TraceTest, ArraysAndBytesAreListed) {
    const Session session;
    Status status;
    const std::int32_t trims[] = {1, -2, 3, -4};
    nQITRMCAPI100_setGenericPropertyInt32Array(session, "Mod1", "DMM.Trims", trims, 4, &status);
    std::uint8_t bytes[2] = {0, 0};
    nQITRMCAPI100_getNvmemBytes(session, "Mod1/calibration", 2, bytes, 2, &status);
    EXPECT_EQ(lines()[1], "setGenericPropertyInt32Array(session=" + handleText(session) +
                              ", resources=\"Mod1\", property=\"DMM.Trims\", array=[1,-2,3,-4]) "
                              "-> 0");
    EXPECT_EQ(lines()[2], "getNvmemBytes(session=" + handleText(session) +
                              ", nvmemArea=\"Mod1/calibration\", address=2) -> 0 buffer=[2,3]");
}

TEST_F(TraceTest, LongValuesAreTruncatedAndNullsAreNamed) {
    const Session session;
    Status status;
    const std::string longText(300, 'x');
    nQITRMCAPI100_setGenericPropertyString(session, "Mod1", "DMM.Note", longText.c_str(), &status);
    std::uint8_t bytes[20] = {};
    nQITRMCAPI100_getNvmemBytes(session, "Mod1/calibration", 0, bytes, 20, &status);
    nQITRMCAPI100_connectToDevices(session, nullptr, 1.5, &status);
    EXPECT_NE(lines()[1].find("value=\"" + longText.substr(0, 200) + "\"...(300 bytes)) -> 0"),
              std::string::npos);
    EXPECT_NE(lines()[2].find("buffer=[0,1,2,3,0,0,0,0,0,0,0,0,0,0,0,0,...(20)]"),
              std::string::npos);
    EXPECT_NE(lines()[3].find("(session=" + handleText(session) +
                              ", devices=null, timeout=1.5) -> -250954 "),
              std::string::npos);
}

TEST_F(TraceTest, LineBreaksAndControlCharactersAreEscaped) {
    const Session session;
    Status status;
    nQITRMCAPI100_setGenericPropertyString(session, "Mod1", "DMM.Note", "a\n\"b\"", &status);
    EXPECT_NE(lines().back().find(R"(value="a\u000a\"b\"")"), std::string::npos);
}

TEST_F(TraceTest, LinesOfDifferentThreadsDoNotInterleave) {
    constexpr int calls = 200;
    const auto work = [] {
        const Session session;
        for (int i = 0; i < calls; ++i) {
            Status status;
            double value = 0.0;
            nQITRMCAPI100_getGenericPropertyDouble(session, "Mod1", "DMM.Range", &value, &status);
        }
    };
    std::thread first(work);
    std::thread second(work);
    first.join();
    second.join();
    // Each also opens and closes a session.
    EXPECT_EQ(lines().size(), 2u * (calls + 2));
}

}  // namespace
