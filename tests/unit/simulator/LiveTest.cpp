#include <algorithm>
#include <cmath>
#include <functional>
#include <thread>

#include "ChassisFile.h"
#include "FaultsInForce.h"
#include "Values.h"

using namespace drivertest;

namespace {

constexpr const char* description = R"({
    "seed": 7,
    "devices": [
        {"name": "Mover", "category": 7,
         "properties": {
             "Time.Ms": {"type": "UInt64", "value": 0},
             "Count.Signed": {"type": "Int32", "value": 2147483000},
             "Count.Unsigned": {"type": "UInt32", "value": 4294967000},
             "Count.Long": {"type": "Int64", "value": 9223372036854775000},
             "Count.Slow": {"type": "UInt32", "value": 5},
             "Count.Limited": {"type": "UInt32", "value": 0, "max": 250},
             "Set": {"type": "Double", "access": "ReadWrite", "value": 4},
             "On": {"type": "Bool", "access": "ReadWrite", "value": false},
             "Lagging": {"type": "Double", "value": 99},
             "Direct": {"type": "Double", "value": 0},
             "Whole": {"type": "Int32", "value": 0},
             "Limited": {"type": "UInt32", "value": 10, "min": 10, "max": 20},
             "Small": {"type": "Int32", "value": 0},
             "Large": {"type": "UInt64", "value": 0},
             "Huge": {"type": "Double", "value": 0},
             "Drifting": {"type": "Double", "value": 10},
             "Noisy": {"type": "Double", "value": 5},
             "Other": {"type": "Double", "value": 5}},
         "commands": {
             "Pass.50ms": {"seconds": 0.05},
             "Pass.100ms": {"seconds": 0.1},
             "Pass.Day": {"seconds": 86400},
             "SwitchOn": {"sets": {"On": true}},
             "Reset": {"resets": true}},
         "live": {
             "Time.Ms": {"counts": {"per_second": 1000}},
             "Count.Signed": {"counts": {"per_second": 1000}},
             "Count.Unsigned": {"counts": {"per_second": 1000}},
             "Count.Long": {"counts": {"per_second": 1000}},
             "Count.Slow": {"counts": {"per_second": 2.5}},
             "Count.Limited": {"counts": {"per_second": 1000}},
             "Lagging": {"follows": {"property": "Set", "while": "On", "factor": 2, "offset": 1,
                                     "time_constant": 0.05}},
             "Direct": {"follows": {"property": "Lagging", "factor": -1}},
             "Whole": {"follows": {"property": "Set", "factor": 0.5}},
             "Limited": {"follows": {"property": "Set"}},
             "Small": {"follows": {"property": "Set", "factor": -1}},
             "Large": {"follows": {"property": "Set"}},
             "Huge": {"follows": {"property": "Set", "factor": 1e300}, "noise": 1},
             "Drifting": {"drift": {"amplitude": 0.5, "period": 2}},
             "Noisy": {"noise": 0.25},
             "Other": {"noise": 0.25}}},
        {"name": "Meter", "category": 7,
         "channels": {"prefix": "in", "count": 3,
                      "properties": {"Level": {"type": "Double", "value": 0.5}},
                      "live": {"Level": {"follows": {"property": "Output", "while": "Switch",
                                                     "resource": "Source/out{n}",
                                                     "optional": true}}}}},
        {"name": "Source", "category": 7,
         "channels": {"prefix": "out", "count": 2,
                      "properties": {
                          "Output": {"type": "Double", "access": "ReadWrite", "value": 0,
                                     "needs_commit": true},
                          "Switch": {"type": "Bool", "access": "ReadWrite", "value": true}}}},
        {"name": "Scope", "category": 7,
         "properties": {
             "Rate": {"type": "Double", "access": "ReadWrite", "value": 8},
             "Length": {"type": "Int32", "access": "ReadWrite", "value": 10},
             "Noise": {"type": "DoubleArray", "value": []},
             "Direct": {"type": "DoubleArray", "value": [9]}},
         "live": {
             "Noise": {"waveform": {"shape": "noise", "amplitude": 2, "offset": 10,
                                    "samples": 10000, "sample_rate": 1}},
             "Direct": {"waveform": {"shape": "dc", "amplitude": 3, "offset": 5, "samples": 4096,
                                     "sample_rate": 1},
                        "noise": 0.5}},
         "channels": {"prefix": "ch", "count": 1,
                      "properties": {
                          "Sine": {"type": "DoubleArray", "value": []},
                          "Square": {"type": "DoubleArray", "value": []},
                          "Triangle": {"type": "DoubleArray", "value": []},
                          "Sawtooth": {"type": "DoubleArray", "value": []},
                          "Steps": {"type": "Int32Array", "value": [], "max": 40}},
                      "live": {
                          "Sine": {"waveform": {"shape": "sine", "frequency": 1, "amplitude": 3,
                                                "offset": 1, "samples": "Length",
                                                "sample_rate": "Rate"}},
                          "Square": {"waveform": {"shape": "square", "frequency": 1,
                                                  "amplitude": 2, "samples": "Length",
                                                  "sample_rate": "Rate"}},
                          "Triangle": {"waveform": {"shape": "triangle", "frequency": 1,
                                                    "amplitude": 1, "samples": "Length",
                                                    "sample_rate": "Rate"}},
                          "Sawtooth": {"waveform": {"shape": "sawtooth", "frequency": 1,
                                                    "amplitude": 1, "samples": "Length",
                                                    "sample_rate": "Rate"}},
                          "Steps": {"waveform": {"shape": "sawtooth", "frequency": 2,
                                                 "amplitude": 100.4, "samples": 5,
                                                 "sample_rate": 8}}}}}
    ]
})";

// The library reads these when it is first used. Time advances by calls: a millisecond each.
class UseDescription : public testing::Environment {
  public:
    void SetUp() override {
        setenv("QITRMC_SIM_CHASSIS", file.path.c_str(), 1);
        setenv("QITRMC_SIM_TIME_SCALE", "calls", 1);
    }

  private:
    ChassisFile file{description};
};

const auto* const environment = testing::AddGlobalTestEnvironment(new UseDescription);

class LiveTest : public testing::Test {
  protected:
    ~LiveTest() override {
        EXPECT_EQ(resetDevices(session, "Mover,Source,Scope"), 0);
        command("Pass.Day");
    }

    // Milliseconds since the reset of the device. The next call is one later.
    std::uint64_t time() { return get(getUInt64, session, "Mover", "Time.Ms").value; }
    double real(const char* property) { return get(getDouble, session, "Mover", property).value; }
    void command(const char* name) {
        Status status;
        nQITRMCAPI100_executeGenericCommand(session, "Mover", name, 86400.0, &status);
        EXPECT_EQ(status.code, 0) << status.text();
    }
    void write(const char* property, double value) {
        EXPECT_EQ(set(setDouble, session, "Mover", property, value).code, 0);
    }
    std::vector<double> record(const char* resource, const char* property) {
        return getArray(getDoubles, session, resource, property).value;
    }

    Session session{"Mover,Source,Scope"};
};

TEST_F(LiveTest, TimeAdvancesByCallsAndByDurations) {
    EXPECT_EQ(resetDevices(session, "Mover"), 0);
    EXPECT_EQ(time(), 1u);
    EXPECT_EQ(time(), 2u);
    command("Pass.50ms");
    EXPECT_EQ(time(), 54u);
    command("Pass.Day");
    EXPECT_EQ(time(), 86400056u);
}

TEST_F(LiveTest, ACommandThatTimesOutTakesItsTimeout) {
    EXPECT_EQ(resetDevices(session, "Mover"), 0);
    Status status;
    nQITRMCAPI100_executeGenericCommand(session, "Mover", "Pass.Day", 2.0, &status);
    EXPECT_EQ(status.code, -250976);
    EXPECT_EQ(time(), 2002u);
}

TEST_F(LiveTest, CountersCountExactlyAndWrap) {
    EXPECT_EQ(resetDevices(session, "Mover"), 0);
    // The first call after the reset is 1 ms later, the second 2 ms.
    EXPECT_EQ(get(getInt32, session, "Mover", "Count.Signed"), 2147483001);
    EXPECT_EQ(get(getUInt32, session, "Mover", "Count.Unsigned"), 4294967002u);
    for (int i = 0; i < 20; ++i) {
        command("Pass.50ms");
    }
    // 2 + 20 * 51 = 1022 ms have passed, and one more with each of these.
    EXPECT_EQ(get(getInt32, session, "Mover", "Count.Signed"), -2147483273);
    EXPECT_EQ(get(getUInt32, session, "Mover", "Count.Unsigned"), 728u);
    EXPECT_EQ(get(getInt64, session, "Mover", "Count.Long"), std::int64_t{-9223372036854775591});
    EXPECT_EQ(get(getUInt32, session, "Mover", "Count.Slow"), 7u);
    EXPECT_EQ(get(getUInt32, session, "Mover", "Count.Limited"), 250u);
}

TEST_F(LiveTest, ACounterWithAFractionalRateCountsWholeEvents) {
    EXPECT_EQ(resetDevices(session, "Mover"), 0);
    command("Pass.Day");
    // 86400.002 s at 2.5 a second are 216000.005.
    EXPECT_EQ(get(getUInt32, session, "Mover", "Count.Slow"), 216005u);
}

TEST_F(LiveTest, ACommandThatResetsRestartsTheCounter) {
    command("Pass.Day");
    command("Reset");
    EXPECT_EQ(time(), 1u);
}

TEST_F(LiveTest, WhatIsSwitchedOffIsZero) {
    EXPECT_EQ(real("Lagging"), 0.0);
    EXPECT_EQ(real("Direct"), 0.0);
}

TEST_F(LiveTest, FollowingWithALagMatchesTheFormula) {
    write("Set", 10.0);
    command("SwitchOn");
    EXPECT_NEAR(real("Lagging"), 21.0 * (1.0 - std::exp(-0.001 / 0.05)), 1e-12);
    EXPECT_NEAR(real("Direct"), -21.0 * (1.0 - std::exp(-0.002 / 0.05)), 1e-12);
    command("Pass.50ms");
    const double reached = 21.0 * (1.0 - std::exp(-0.054 / 0.05));
    EXPECT_NEAR(real("Lagging"), reached, 1e-12);
    // A new target is approached from the value at the time of the change.
    write("Set", 1.0);
    const double start = 21.0 * (1.0 - std::exp(-0.055 / 0.05));
    EXPECT_NEAR(real("Lagging"), 3.0 + (start - 3.0) * std::exp(-0.001 / 0.05), 1e-12);
    EXPECT_EQ(set(setBool, session, "Mover", "On", std::uint8_t{0}).code, 0);
    command("Pass.Day");
    EXPECT_EQ(real("Lagging"), 0.0);
}

TEST_F(LiveTest, WritingTheSameTargetAgainChangesNothing) {
    command("SwitchOn");
    write("Set", 4.0);
    EXPECT_NEAR(real("Lagging"), 9.0 * (1.0 - std::exp(-0.002 / 0.05)), 1e-12);
}

TEST_F(LiveTest, AResetLetsTheOutputFallWithItsLag) {
    command("SwitchOn");
    command("Pass.Day");
    EXPECT_EQ(real("Lagging"), 9.0);
    EXPECT_EQ(resetDevices(session, "Mover"), 0);
    EXPECT_NEAR(real("Lagging"), 9.0 * std::exp(-0.001 / 0.05), 1e-12);
    command("Pass.Day");
    EXPECT_EQ(real("Lagging"), 0.0);
}

TEST_F(LiveTest, WholeNumbersAreRoundedAndLimited) {
    write("Set", 5.0);
    EXPECT_EQ(get(getInt32, session, "Mover", "Whole"), 3);
    write("Set", -4.8);
    EXPECT_EQ(get(getInt32, session, "Mover", "Whole"), -2);
    EXPECT_EQ(get(getUInt32, session, "Mover", "Limited"), 10u);
    write("Set", 15.4);
    EXPECT_EQ(get(getUInt32, session, "Mover", "Limited"), 15u);
    write("Set", 20.6);
    EXPECT_EQ(get(getUInt32, session, "Mover", "Limited"), 20u);
}

TEST_F(LiveTest, NumbersBeyondTheTypeStopAtItsEnds) {
    write("Set", 2147483649.0);
    EXPECT_EQ(get(getInt32, session, "Mover", "Small"), -2147483647 - 1);
    write("Set", -2147483647.4);
    EXPECT_EQ(get(getInt32, session, "Mover", "Small"), 2147483647);
    write("Set", 1e30);
    EXPECT_EQ(get(getUInt64, session, "Mover", "Large"), std::uint64_t{18446744073709551615u});
    write("Set", -1.0);
    EXPECT_EQ(get(getUInt64, session, "Mover", "Large"), std::uint64_t{0});
}

TEST_F(LiveTest, NumbersAreAlwaysFinite) {
    for (const double wild : {HUGE_VAL, -HUGE_VAL, std::nan(""), 1.7e308, -1.7e308}) {
        write("Set", wild);
        command("SwitchOn");
        EXPECT_TRUE(std::isfinite(real("Huge"))) << wild;
        EXPECT_TRUE(std::isfinite(real("Lagging"))) << wild;
        EXPECT_TRUE(std::isfinite(real("Direct"))) << wild;
    }
}

TEST_F(LiveTest, ChannelsFollowTheChannelOfTheSameNumber) {
    const std::vector<double> still{0.0, 0.0, 0.5};
    EXPECT_EQ(record("Meter/in0:2", "Level"), still);
    EXPECT_EQ(set(setDouble, session, "Source/out1", "Output", 2.5).code, 0);
    EXPECT_EQ(record("Meter/in0:2", "Level"), still);
    Status status;
    nQITRMCAPI100_commitPropertiesGeneric(session, "Source", &status);
    EXPECT_EQ(record("Meter/in0:2", "Level"), (std::vector<double>{0.0, 2.5, 0.5}));
    EXPECT_EQ(set(setBool, session, "Source/out1", "Switch", std::uint8_t{0}).code, 0);
    EXPECT_EQ(record("Meter/in0:2", "Level"), still);
}

TEST_F(LiveTest, DriftStaysWithinItsAmplitudeAndIsSmooth) {
    // The steepest slope is 1.5 times the distance between two directions, at most twice the
    // amplitude.
    const double steepest = 1.5 * 2.0 * 0.5 / 2.0;
    double lowest = 11.0;
    double highest = 9.0;
    double previous = real("Drifting");
    for (int i = 0; i < 2000; ++i) {
        command("Pass.100ms");
        const double present = real("Drifting");
        ASSERT_GE(present, 9.5);
        ASSERT_LE(present, 10.5);
        ASSERT_LE(std::fabs(present - previous), steepest * 0.102 + 1e-9);
        lowest = std::min(lowest, present);
        highest = std::max(highest, present);
        previous = present;
    }
    // 102 directions: the probability that none is near an end is below 1e-4.
    EXPECT_LT(lowest, 9.6);
    EXPECT_GT(highest, 10.4);
}

struct Moments {
    double mean;
    double deviation;
    double correlation;
};

Moments momentsOf(const std::vector<double>& numbers) {
    const auto count = static_cast<double>(numbers.size());
    double mean = 0.0;
    for (const double number : numbers) {
        mean += number / count;
    }
    double variance = 0.0;
    double covariance = 0.0;
    for (std::size_t i = 0; i < numbers.size(); ++i) {
        variance += (numbers[i] - mean) * (numbers[i] - mean) / count;
        covariance += i == 0 ? 0.0 : (numbers[i] - mean) * (numbers[i - 1] - mean) / count;
    }
    return {mean, std::sqrt(variance), covariance / variance};
}

TEST_F(LiveTest, NoiseHasItsStandardDeviation) {
    std::vector<double> numbers;
    for (int i = 0; i < 10000; ++i) {
        numbers.push_back(real("Noisy"));
        ASSERT_LE(std::fabs(numbers.back() - 5.0), 6 * 0.25);
    }
    // Five standard errors each: 0.25 / sqrt(10000), 0.25 / sqrt(20000), 1 / sqrt(10000).
    const Moments moments = momentsOf(numbers);
    EXPECT_NEAR(moments.mean, 5.0, 0.0125);
    EXPECT_NEAR(moments.deviation, 0.25, 0.0089);
    EXPECT_NEAR(moments.correlation, 0.0, 0.05);
    // Two thirds lie within one standard deviation: 6827, with an error of 47.
    const auto near = std::count_if(numbers.begin(), numbers.end(),
                                    [](double number) { return std::fabs(number - 5.0) < 0.25; });
    EXPECT_NEAR(static_cast<double>(near), 6827.0, 5 * 47.0);
}

TEST_F(LiveTest, EachPropertyHasRandomNumbersOfItsOwn) {
    EXPECT_EQ(resetDevices(session, "Mover"), 0);
    const double noisy = real("Noisy");
    EXPECT_EQ(resetDevices(session, "Mover"), 0);
    EXPECT_NE(real("Other"), noisy);
    EXPECT_EQ(resetDevices(session, "Mover"), 0);
    EXPECT_EQ(real("Noisy"), noisy);
}

void expectSamples(const std::vector<double>& samples, const std::vector<double>& expected) {
    ASSERT_EQ(samples.size(), expected.size());
    for (std::size_t i = 0; i < samples.size(); ++i) {
        EXPECT_NEAR(samples[i], expected[i], 1e-12) << "sample " << i;
    }
}

TEST_F(LiveTest, WaveformsMatchTheirFormulasSampleBySample) {
    const double slant = 1.0 + 3.0 * std::sqrt(0.5);
    const double down = 1.0 - 3.0 * std::sqrt(0.5);
    expectSamples(record("Scope/ch0", "Sine"),
                  {1.0, slant, 4.0, slant, 1.0, down, -2.0, down, 1.0, slant});
    expectSamples(record("Scope/ch0", "Square"),
                  {2.0, 2.0, 2.0, 2.0, -2.0, -2.0, -2.0, -2.0, 2.0, 2.0});
    expectSamples(record("Scope/ch0", "Triangle"),
                  {0.0, 0.5, 1.0, 0.5, 0.0, -0.5, -1.0, -0.5, 0.0, 0.5});
    expectSamples(record("Scope/ch0", "Sawtooth"),
                  {-1.0, -0.75, -0.5, -0.25, 0.0, 0.25, 0.5, 0.75, -1.0, -0.75});
    EXPECT_EQ(getArray(getInt32s, session, "Scope/ch0", "Steps"),
              (std::vector<std::int32_t>{-100, -50, 0, 40, -100}));
}

TEST_F(LiveTest, TheSineOfEachPartOfATurnIsThatOfTheLibrary) {
    EXPECT_EQ(set(setDouble, session, "Scope", "Rate", 1000.0).code, 0);
    EXPECT_EQ(set(setInt32, session, "Scope", "Length", 1000).code, 0);
    const auto samples = record("Scope/ch0", "Sine");
    ASSERT_EQ(samples.size(), 1000u);
    for (int i = 0; i < 1000; ++i) {
        ASSERT_NEAR(samples[static_cast<std::size_t>(i)],
                    1.0 + 3.0 * std::sin(2.0 * M_PI * i / 1000.0), 1e-14);
    }
}

TEST_F(LiveTest, SamplesAreLimited) {
    EXPECT_EQ(set(setInt32, session, "Scope", "Length", 2147483647).code, 0);
    EXPECT_EQ(record("Scope/ch0", "Square").size(), 1048576u);
    EXPECT_EQ(set(setInt32, session, "Scope", "Length", -1).code, 0);
    EXPECT_EQ(record("Scope/ch0", "Square").size(), 0u);
}

TEST_F(LiveTest, WithoutARateAllSamplesAreTheFirst) {
    EXPECT_EQ(set(setDouble, session, "Scope", "Rate", 0.0).code, 0);
    expectSamples(record("Scope/ch0", "Sawtooth"), std::vector<double>(10, -1.0));
    EXPECT_EQ(set(setDouble, session, "Scope", "Rate", 1e-320).code, 0);
    for (const double sample : record("Scope/ch0", "Sine")) {
        EXPECT_TRUE(std::isfinite(sample));
    }
}

TEST_F(LiveTest, NoiseAsAWaveformIsSpreadEvenly) {
    const auto samples = record("Scope", "Noise");
    ASSERT_EQ(samples.size(), 10000u);
    EXPECT_GE(*std::min_element(samples.begin(), samples.end()), 8.0);
    EXPECT_LE(*std::max_element(samples.begin(), samples.end()), 12.0);
    // The deviation of an even spread is its width divided by sqrt(12).
    const Moments moments = momentsOf(samples);
    EXPECT_NEAR(moments.mean, 10.0, 5 * 1.1547 / 100.0);
    EXPECT_NEAR(moments.deviation, 1.1547, 0.03);
    EXPECT_NEAR(moments.correlation, 0.0, 0.05);
}

TEST_F(LiveTest, NoiseGoesWithAWaveform) {
    const auto samples = record("Scope", "Direct");
    ASSERT_EQ(samples.size(), 4096u);
    const Moments moments = momentsOf(samples);
    EXPECT_NEAR(moments.mean, 5.0, 5 * 0.5 / 64.0);
    EXPECT_NEAR(moments.deviation, 0.5, 5 * 0.5 / 90.5);
    EXPECT_NEAR(moments.correlation, 0.0, 5.0 / 64.0);
    // Another record has other noise.
    EXPECT_NE(record("Scope", "Direct"), samples);
}

TEST_F(LiveTest, AnEventThatIsOverAtTheEndOfACommandEndsIt) {
    const FaultsInForce faults(
        R"({"events": [{"device": "Mover", "event": "connection_lost", "after": 0.01,
                        "lasts": 0.01}]})");
    Status status;
    nQITRMCAPI100_executeGenericCommand(session, "Mover", "Pass.100ms", 1.0, &status);
    EXPECT_EQ(status.code, -250941);
}

TEST_F(LiveTest, EventsBeginAndEndAtTheirTimes) {
    const FaultsInForce faults(
        R"({"events": [{"device": "Mover", "event": "connection_lost", "after": 0.003,
                        "lasts": 0.002},
                       {"device": "Mover", "event": "connection_lost", "after": 0.006,
                        "lasts": 0.001}]})");
    std::vector<std::int32_t> codes;
    for (int call = 0; call < 7; ++call) {
        codes.push_back(get(getDouble, session, "Mover", "Set").code);
    }
    // A millisecond passes at the beginning of each call.
    EXPECT_EQ(codes, (std::vector<std::int32_t>{0, 0, -250941, -250941, 0, -250941, 0}));
}

TEST_F(LiveTest, AFaultAppliesToAndCountsTheCallsOfItsTime) {
    const auto codesWith = [&](const std::string& members) {
        const FaultsInForce faults(
            oneFault("\"function\":\"abortSession\",\"status\":{\"code\":-77}," + members));
        std::vector<std::int32_t> codes;
        for (int call = 0; call < 5; ++call) {
            codes.push_back(session.abort());
        }
        return codes;
    };
    // A millisecond passes at the beginning of each call.
    using Codes = std::vector<std::int32_t>;
    EXPECT_EQ(codesWith("\"after\":0.003"), (Codes{0, 0, -77, -77, -77}));
    EXPECT_EQ(codesWith("\"lasts\":0.003"), (Codes{-77, -77, 0, 0, 0}));
    EXPECT_EQ(codesWith("\"after\":0.003,\"lasts\":0.002"), (Codes{0, 0, -77, -77, 0}));
    EXPECT_EQ(codesWith("\"after\":0.003,\"lasts\":0.002,\"calls\":{\"first\":2}"),
              (Codes{0, 0, 0, -77, 0}));
}

TEST_F(LiveTest, ManyThreadsMayReadAndWriteAtOnce) {
    std::vector<std::thread> threads;
    for (int i = 0; i < 4; ++i) {
        threads.emplace_back([this, i] {
            for (int step = 0; step < 200; ++step) {
                write("Set", i + step);
                EXPECT_TRUE(std::isfinite(real("Lagging")));
                EXPECT_EQ(record("Scope/ch0", "Square").size(), 10u);
            }
        });
    }
    for (std::thread& thread : threads) {
        thread.join();
    }
}

}  // namespace
