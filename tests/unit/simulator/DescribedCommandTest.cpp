#include <chrono>
#include <limits>

#include "ChassisFile.h"
#include "Values.h"
#include "support/TestPaths.h"

using namespace drivertest;

namespace {

// Restores the device to its state after power-on.
class DescribedCommandTest : public testing::Test {
  protected:
    ~DescribedCommandTest() override { EXPECT_EQ(resetDevices(session, "Unit"), 0); }

    std::int32_t run(const char* command, const char* resources = "Unit") {
        return execute(session, resources, command, 1.0).code;
    }
    std::uint32_t runs() { return get(getUInt32, session, "Unit", "Runs").value; }
    std::uint64_t cycles() { return get(getUInt64, session, "Unit", "Cycles").value; }

    Session session{"Unit"};
};

TEST_F(DescribedCommandTest, AnAddedValueStaysWithinTheLimits) {
    EXPECT_EQ(run("Raise"), 0);
    EXPECT_EQ(get(getUInt32, session, "Unit", "Steps"), 10u);
}

TEST_F(DescribedCommandTest, AnAddedValueStaysFinite) {
    EXPECT_EQ(run("Grow"), 0);
    EXPECT_EQ(get(getDouble, session, "Unit", "Big"), std::numeric_limits<double>::max());
}

TEST_F(DescribedCommandTest, AFailedCommandHasNoEffect) {
    EXPECT_EQ(run("Always"), -1);
    EXPECT_EQ(runs(), 0u);
}

TEST_F(DescribedCommandTest, AFailureIsReportedAfterTheDurationOfTheCommand) {
    const auto start = std::chrono::steady_clock::now();
    EXPECT_EQ(run("Short"), -7);
    EXPECT_GE(std::chrono::steady_clock::now() - start, std::chrono::milliseconds(50));
    EXPECT_EQ(runs(), 0u);
    // The timeout ends first.
    EXPECT_EQ(execute(session, "Unit", "Short", 0.0).code, -250976);
}

TEST_F(DescribedCommandTest, AFailureDependsOnAProperty) {
    EXPECT_EQ(run("Busy"), 0);
    EXPECT_EQ(run("Busy"), -2);
    EXPECT_EQ(set(setInt32, session, "Unit", "Phase", 0).code, 0);
    EXPECT_EQ(run("Busy"), 0);
    EXPECT_EQ(runs(), 2u);
}

TEST_F(DescribedCommandTest, APropertyOfAFailureMayBeAnArrayOrSecret) {
    EXPECT_EQ(run("Listed"), 0);
    EXPECT_EQ(setArray(setTexts, session, "Unit", "Texts", {"a", "b"}).code, 0);
    EXPECT_EQ(run("Listed"), -2);
    EXPECT_EQ(run("Secretive"), 0);
    EXPECT_EQ(set(setUInt32, session, "Unit", "Secret", 5u).code, 0);
    EXPECT_EQ(run("Secretive"), -2);
}

TEST_F(DescribedCommandTest, EachThirdExecutionFails) {
    for (const std::int32_t expected : {0, 0, -3, 0, 0, -3}) {
        EXPECT_EQ(run("Third"), expected);
    }
    EXPECT_EQ(runs(), 4u);
}

TEST_F(DescribedCommandTest, OnlyCompletedCommandsAreCounted) {
    Session other;
    EXPECT_EQ(execute(other, "Unit", "Second", 1.0).code, -250811);
    EXPECT_EQ(execute(session, "Unit", "Second", 0.0).code, -250976);
    EXPECT_EQ(run("Second"), 0);
    EXPECT_EQ(execute(session, "Unit", "Second", 0.0).code, -250976);
    EXPECT_EQ(run("Second"), -8);
}

TEST_F(DescribedCommandTest, AResetDoesNotRestartTheCount) {
    EXPECT_EQ(run("Third"), 0);
    EXPECT_EQ(resetDevices(session, "Unit"), 0);
    EXPECT_EQ(run("Third"), 0);
    EXPECT_EQ(run("Third"), -3);
}

TEST_F(DescribedCommandTest, Probabilities0And1AreExact) {
    for (int i = 0; i < 1000; ++i) {
        ASSERT_EQ(run("Never"), 0);
        ASSERT_EQ(run("Surely"), -4);
    }
}

TEST_F(DescribedCommandTest, FailuresOccurAsOftenAsTheirProbability) {
    const auto failuresOf = [&](const char* command) {
        int failures = 0;
        for (int i = 0; i < 10000; ++i) {
            failures += run(command) == -4 ? 1 : 0;
        }
        return failures;
    };
    // Six standard deviations on both sides.
    EXPECT_NEAR(failuresOf("Perhaps"), 5000, 300);
    EXPECT_NEAR(failuresOf("Rarely"), 1000, 180);
}

TEST_F(DescribedCommandTest, AWarningComesWithTheEffect) {
    const Outcome outcome = execute(session, "Unit", "Warns", 0.0);
    EXPECT_EQ(outcome.code, 5);
    EXPECT_EQ(outcome.text,
              "{\"error_constant\":\"warm\",\"component\":\"qitrmcapi\",\"translator\":"
              "\"mxlator_qitrmc\",\"translator_info\":{\"ordered_data\":[]}}");
    EXPECT_EQ(runs(), 1u);
}

TEST_F(DescribedCommandTest, ACommandHasItsEffectEvenIfTheTextOfItsWarningDoesNotFit) {
    Status status;
    status.starve();
    nQITRMCAPI100_executeGenericCommand(session, "Unit", "Warns", 0.0, &status);
    EXPECT_EQ(status.code, 5);
    EXPECT_EQ(runs(), 1u);
}

TEST_F(DescribedCommandTest, AChannelCountsOnItsDevice) {
    EXPECT_EQ(run("Switch", "Unit/ch0"), 0);
    EXPECT_EQ(cycles(), 1u);
    EXPECT_EQ(getText(session, "Unit", "Note"), std::string("switched"));
    EXPECT_EQ(run("Switch", "Unit/ch0:1"), 0);
    EXPECT_EQ(cycles(), 3u);
}

TEST_F(DescribedCommandTest, AFailureOfOneResourceLeavesAllWithoutEffect) {
    EXPECT_EQ(set(setBool, session, "Unit/ch1", "Fault", std::uint8_t{1}).code, 0);
    EXPECT_EQ(run("Switch", "Unit/ch0:1"), -6);
    EXPECT_EQ(getArray(getDoubles, session, "Unit/ch0:1", "Level"),
              (std::vector<double>{0.0, 0.0}));
    EXPECT_EQ(cycles(), 0u);
}

TEST_F(DescribedCommandTest, AResetComesBeforeTheOtherEffects) {
    EXPECT_EQ(run("Busy"), 0);
    EXPECT_EQ(set(setUInt32, session, "Unit", "Held", 9u).code, 0);
    EXPECT_EQ(run("Resets"), 0);
    EXPECT_EQ(runs(), 5u);
    EXPECT_EQ(cycles(), 2u);
    EXPECT_EQ(get(getInt32, session, "Unit", "Phase"), 0);
    Status status;
    nQITRMCAPI100_commitPropertiesGeneric(session, "Unit", &status);
    EXPECT_EQ(status.code, 0) << status.text();
    EXPECT_EQ(get(getUInt32, session, "Unit", "Held"), 1u);
}

// The random outcomes in a new process: a digit for each execution.
std::string decisions(const std::string& arguments) {
    const ChassisFile output("");
    EXPECT_EQ(std::system((std::string(chanceProbe) + arguments + " >" + output.path).c_str()), 0);
    std::ifstream file(output.path);
    return std::string(std::istreambuf_iterator<char>(file), {});
}

TEST(ChanceTest, EveryProcessHasTheSameRandomFailures) {
    const std::string first = decisions(" Unit Perhaps");
    EXPECT_EQ(first.size(), 256u);
    EXPECT_EQ(first.find_first_not_of("01"), std::string::npos);
    EXPECT_EQ(decisions(" Unit Perhaps"), first);
}

TEST(ChanceTest, CommandsFailIndependentlyOfEachOther) {
    const std::string alone = decisions(" Unit Perhaps");
    EXPECT_EQ(decisions(" Unit Perhaps Rarely"), alone);
    EXPECT_NE(decisions(" Unit Rarely"), alone);
}

}  // namespace
