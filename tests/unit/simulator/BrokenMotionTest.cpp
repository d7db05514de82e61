#include "ChassisProbe.h"

using namespace drivertest;

namespace {

// A device whose property X of this type has this motion.
std::string moving(const std::string& type, const std::string& value, const std::string& motion) {
    return device(
        ",\"properties\":{\"X\":{\"type\":\"" + type + "\",\"value\":" + value +
        "},\"N\":{\"type\":\"Double\",\"value\":0},\"T\":{\"type\":\"String\",\"value\":\"\"}}," +
        "\"live\":{\"X\":" + motion + "}");
}

void expectMotionFault(const std::string& motion, const std::string& pointer,
                       const std::string& words) {
    expectFault(moving("Double", "0", motion), "/devices/0/live/X" + pointer, words);
}

TEST(BrokenMotionTest, OnlyStoredPropertiesCanMove) {
    const char* const words =
        "is not a stored property of the resource; only properties that the resource has and that "
        "hold a value can move";
    expectFault(device(",\"live\":{\"Y\":{\"noise\":1}}"), "/devices/0/live/Y", words);
    expectFault(device(",\"live\":{\"Dev.Name\":{\"noise\":1}}"), "/devices/0/live/Dev.Name",
                words);
    expectFault(device(",\"live\":[]"), "/devices/0/live", "is an array; must be an object");
}

TEST(BrokenMotionTest, AMotionMustHaveAnEffect) {
    expectMotionFault("{}", "",
                      "does not move; must hold follows, drift, noise, counts or waveform");
    expectMotionFault("{\"jumps\":1}", "/jumps",
                      "is not a known member; the members here are follows, drift, noise, counts, "
                      "waveform");
}

TEST(BrokenMotionTest, NumbersOutOfRangeAreRefused) {
    expectMotionFault("{\"noise\":-1}", "/noise", "is -1; must be a number from 0 to 1e+300");
    expectMotionFault("{\"noise\":\"1\"}", "/noise",
                      "is the text \"1\"; must be a number from 0 to 1e+300");
    expectMotionFault("{\"drift\":{\"amplitude\":1,\"period\":0}}", "/drift/period",
                      "is 0; must be a number from 0.001 to 1e+09");
    expectMotionFault("{\"drift\":{\"period\":1}}", "/drift/amplitude",
                      "is missing; must be how far it goes");
    expectFault(moving("Int32", "0", "{\"counts\":{\"per_second\":-1}}"),
                "/devices/0/live/X/counts/per_second", "is -1; must be a number from 0 to 1e+09");
    expectMotionFault("{\"follows\":{\"property\":\"N\",\"time_constant\":86401}}",
                      "/follows/time_constant", "is 86401; must be a number from 0 to 86400");
}

TEST(BrokenMotionTest, TheMotionMustFitTheType) {
    expectFault(moving("String", "\"\"", "{\"noise\":1}"), "/devices/0/live/X",
                "does not suit a property of type String; only a single number moves like this");
    expectFault(moving("DoubleArray", "[]", "{\"drift\":{\"amplitude\":1,\"period\":1}}"),
                "/devices/0/live/X",
                "does not suit a property of type DoubleArray; only a single number moves like "
                "this");
    expectMotionFault("{\"counts\":{\"per_second\":1}}", "/counts",
                      "does not suit a property of type Double; only whole numbers count");
    expectMotionFault("{\"waveform\":{}}", "/waveform",
                      "does not suit a property of type Double; a waveform is a DoubleArray or an "
                      "Int32Array");
    expectFault(
        "{\"enums\":{\"E\":{\"A\":0}},\"devices\":[{\"name\":\"A\",\"category\":1,"
        "\"properties\":{\"X\":{\"type\":\"Int32\",\"enum\":\"E\",\"value\":0}},"
        "\"live\":{\"X\":{\"noise\":1}}}]}",
        "/devices/0/live/X", "moves an enumeration; only numbers that stand for themselves move");
}

TEST(BrokenMotionTest, CountsAndWaveformsAreNotCombinedWithOtherMotions) {
    expectMotionFault("{\"counts\":{\"per_second\":1},\"noise\":1}", "",
                      "counts and moves otherwise too; counts stands alone");
    expectMotionFault("{\"waveform\":{},\"drift\":{}}", "",
                      "is a waveform and moves otherwise too; a waveform goes with noise alone");
    expectFault(device(",\"properties\":{\"X\":{\"type\":\"Int32\",\"value\":0,"
                       "\"access\":\"ReadWrite\"}},\"live\":{\"X\":{\"counts\":"
                       "{\"per_second\":1}}}"),
                "/devices/0/live/X/counts",
                "counts in a property that can be written; the access must be ReadOnly");
}

TEST(BrokenMotionTest, AFollowedPropertyMustExist) {
    expectMotionFault("{\"follows\":{}}", "/follows/property",
                      "is missing; must be the name of a property");
    expectMotionFault("{\"follows\":{\"property\":\"Y\"}}", "/follows/property",
                      "is not a stored property of A; must be a property that holds a value");
    expectMotionFault("{\"follows\":{\"property\":\"N\",\"resource\":\"B/ch{n}\"}}",
                      "/follows/resource",
                      "is not a known resource: B/ch{n}; must be the full name of a device, a "
                      "channel or an NVMEM area, or optional");
    expectMotionFault("{\"follows\":{\"property\":\"T\"}}", "/follows/property",
                      "does not suit a property of type String; only a single number can be "
                      "followed");
    expectMotionFault("{\"follows\":{\"property\":\"N\",\"while\":\"N\"}}", "/follows/while",
                      "does not suit a property of type Double; must be a Bool");
}

TEST(BrokenMotionTest, TheNumberOfTheChannelIsInserted) {
    expectFault(
        "{\"devices\":[{\"name\":\"A\",\"category\":1,\"channels\":{\"prefix\":\"x\","
        "\"count\":3,\"properties\":{\"X\":{\"type\":\"Double\",\"value\":0}},\"live\":"
        "{\"X\":{\"follows\":{\"property\":\"Y\",\"resource\":\"B/ch{n}\"}}}}},"
        "{\"name\":\"B\",\"category\":1,\"channels\":{\"prefix\":\"ch\",\"count\":2,"
        "\"properties\":{\"Y\":{\"type\":\"Double\",\"value\":0}}}}]}",
        "/devices/0/channels/live/X/follows/resource",
        "is not a known resource: B/ch2; must be the full name of a device, a channel or "
        "an NVMEM area, or optional");
}

std::string numbers(int count) {
    std::string text;
    for (int i = 0; i < count; ++i) {
        text +=
            (i == 0 ? "\"P" : ",\"P") + std::to_string(i) + "\":{\"type\":\"Double\",\"value\":0}";
    }
    return text;
}

std::string following(int who, int whom, const std::string& more = "") {
    return "\"P" + std::to_string(who) + "\":{\"follows\":{\"property\":\"P" +
           std::to_string(whom) + "\"" + more + "}}";
}

TEST(BrokenMotionTest, APropertyCannotFollowItself) {
    expectMotionFault("{\"follows\":{\"property\":\"X\"}}", "/follows",
                      "follows itself; must not go round in a circle");
    expectFault(device(",\"properties\":{" + numbers(3) + "},\"live\":{" + following(0, 1) + "," +
                       following(1, 2) + "," + following(2, 0) + "}"),
                "/devices/0/live/P0/follows", "follows itself; must not go round in a circle");
}

TEST(BrokenMotionTest, ChainsHaveALimitedLength) {
    std::string live;
    for (int i = 0; i < 16; ++i) {
        live += (i == 0 ? "" : ",") + following(i, i + 1);
    }
    const ChassisFile longest(
        device(",\"properties\":{" + numbers(18) + "},\"live\":{" + live + "}"));
    EXPECT_EQ(openWith(longest.path).output, "0\n\n1 2 3\n");
    expectFault(device(",\"properties\":{" + numbers(18) + "},\"live\":{" + live + "," +
                       following(16, 17) + "}"),
                "/devices/0/live/P0/follows",
                "follows over more than 16 properties; must be a shorter chain, and no circle");
}

TEST(BrokenMotionTest, ALagNeedsATargetWithoutMotion) {
    expectFault(device(",\"properties\":{" + numbers(3) + "},\"live\":{" +
                       following(0, 1, ",\"time_constant\":1") + "," + following(1, 2) + "}"),
                "/devices/0/live/P0/follows",
                "follows a property that moves itself, with a time constant; "
                "leave time_constant out, or follow a property that keeps still");
}

void expectWaveformFault(const std::string& members, const std::string& pointer,
                         const std::string& words) {
    expectFault(moving("DoubleArray", "[]", "{\"waveform\":{" + members + "}}"),
                "/devices/0/live/X/waveform" + pointer, words);
}

TEST(BrokenMotionTest, WaveformsMustBeComplete) {
    expectWaveformFault("\"samples\":1,\"sample_rate\":1", "/shape",
                        "is missing; must be the name of a shape");
    expectWaveformFault("\"shape\":\"round\",\"samples\":1,\"sample_rate\":1", "/shape",
                        "is not a known shape; must be dc, noise, sawtooth, sine, square or "
                        "triangle");
    expectWaveformFault("\"shape\":\"dc\",\"sample_rate\":1", "/samples",
                        "is missing; must be a number, or the name of a property");
    expectWaveformFault("\"shape\":\"dc\",\"samples\":1048577,\"sample_rate\":1", "/samples",
                        "is 1048577; must be a number from 0 to 1048576");
    expectWaveformFault("\"shape\":\"dc\",\"samples\":\"Y\",\"sample_rate\":1", "/samples",
                        "is not a stored property of A; must be a property that holds a value");
    expectWaveformFault("\"shape\":\"dc\",\"samples\":\"T\",\"sample_rate\":1", "/samples",
                        "does not suit a property of type String; must be a single number");
    expectWaveformFault("\"shape\":\"dc\",\"samples\":1,\"sample_rate\":0", "/sample_rate",
                        "is 0; must be a number from 1e-12 to 1e+12");
    expectWaveformFault("\"shape\":\"dc\",\"samples\":1,\"sample_rate\":1,\"frequency\":-1",
                        "/frequency", "is -1; must be a number from 0 to 1e+12");
}

TEST(BrokenMotionTest, TheSeedIsAWholeNumber) {
    const ChassisFile most("{\"seed\":18446744073709551615,\"devices\":[]}");
    EXPECT_EQ(openWith(most.path).output, "0\n\n1 2 3\n");
    const std::pair<const char*, const char*> seeds[] = {
        {"-1", "-1"},
        {"1.0", "1.0"},
        {"18446744073709551616", "18446744073709551616.0"},
        {"\"1\"", "the text \"1\""}};
    for (const auto& [seed, shown] : seeds) {
        expectFault("{\"seed\":" + std::string(seed) + ",\"devices\":[]}", "/seed",
                    "is " + std::string(shown) +
                        "; must be a whole number from 0 to "
                        "18446744073709551615");
    }
}

void expectVariableFault(const std::string& variable, const std::string& value,
                         const std::string& right) {
    const Probe probe = openWith("", variable + "='" + value + "'");
    EXPECT_EQ(
        probe.output,
        "-250952\n" +
            detailsOf("chassisNotLoaded",
                      usage("FileName", "\"" + variable + "\"") + "," +
                          usage("JsonDocPointer", "\"\"") + "," +
                          usage("Details", "\"is \\\"" + value + "\\\"; must be " + right + "\"")) +
            "\n0 0 0\n");
    EXPECT_EQ(probe.errors,
              "qitrmcapi: " + variable + ": is \"" + value + "\"; must be " + right + "\n");
}

TEST(BrokenMotionTest, ASeedInTheEnvironmentIsAWholeNumber) {
    EXPECT_EQ(openWith("", "QITRMC_SIM_SEED=18446744073709551615").output, "0\n\n1 2 3\n");
    EXPECT_EQ(openWith("", "QITRMC_SIM_SEED=").output, "0\n\n1 2 3\n");
    for (const char* seed : {"-1", "1.0", "18446744073709551616", "seven", "1 "}) {
        expectVariableFault("QITRMC_SIM_SEED", seed,
                            "a whole number from 0 to 18446744073709551615");
    }
}

TEST(BrokenMotionTest, ATimeScaleIsANumberOrTheWordCalls) {
    for (const char* scale : {"calls", "0.001", "1000000", "1e3", ""}) {
        EXPECT_EQ(openWith("", std::string("QITRMC_SIM_TIME_SCALE=") + scale).output,
                  "0\n\n1 2 3\n");
    }
    for (const char* scale :
         {"0", "-1", "0.0009", "1000001", "nan", "inf", "Calls", "1x", "1e999"}) {
        expectVariableFault("QITRMC_SIM_TIME_SCALE", scale,
                            "a number from 0.001 to 1000000, or the word calls");
    }
}

}  // namespace
