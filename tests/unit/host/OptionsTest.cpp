#include "host/Options.h"

#include <gmock/gmock.h>

#include "host/Failure.h"

namespace {

using host::Options;
using host::parseOptions;
using host::UsageError;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::StartsWith;

std::string usageErrorOf(const std::vector<std::string>& arguments) {
    try {
        parseOptions(arguments);
    } catch (const UsageError& error) {
        return error.what();
    }
    return "no usage error";
}

TEST(Options, WithoutArgumentsTheHostServesOnTheLoopbackPort) {
    const Options options = parseOptions({});
    EXPECT_EQ(options.notice, "");
    EXPECT_EQ(options.address, "127.0.0.1");
    EXPECT_EQ(options.port, "8080");
    EXPECT_EQ(options.plugin, "");
    EXPECT_EQ(options.chassis, "");
    EXPECT_EQ(options.state, "");
    EXPECT_EQ(options.faults, "");
    EXPECT_EQ(options.trace, "");
    EXPECT_EQ(options.seed, "");
    EXPECT_EQ(options.timeScale, "");
    EXPECT_EQ(options.threads, 512u);
    EXPECT_EQ(options.connections, 16384u);
    EXPECT_EQ(options.maxBody, 16777216u);
    EXPECT_EQ(options.timeout, 30u);
    EXPECT_THAT(options.hostNames, ElementsAre());
    EXPECT_THAT(options.allowedOrigins, ElementsAre());
    EXPECT_EQ(options.tlsCertificate, "");
    EXPECT_EQ(options.tlsKey, "");
    EXPECT_FALSE(options.passTransport);
    EXPECT_FALSE(options.noHealth);
    EXPECT_FALSE(options.noMetrics);
    EXPECT_FALSE(options.noPanel);
}

TEST(Options, EachOptionSetsItsOwnField) {
    const Options options = parseOptions(
        {"--listen",      "0.0.0.0:81", "--plugin",        "p.so",   "--chassis",      "c.json",
         "--state",       "s",          "--faults",        "f.json", "--seed",         "7",
         "--time-scale",  "8",          "--trace",         "t",      "--threads",      "3",
         "--max-body",    "4",          "--timeout",       "5",      "--tls-cert",     "cert.pem",
         "--tls-key",     "key.pem",    "--host-name",     "lab",    "--allow-origin", "http://a:1",
         "--connections", "6",          "--pass-transport"});
    EXPECT_EQ(options.address, "0.0.0.0");
    EXPECT_EQ(options.port, "81");
    EXPECT_EQ(options.plugin, "p.so");
    EXPECT_EQ(options.chassis, "c.json");
    EXPECT_EQ(options.state, "s");
    EXPECT_EQ(options.faults, "f.json");
    EXPECT_EQ(options.trace, "t");
    EXPECT_EQ(options.seed, "7");
    EXPECT_EQ(options.timeScale, "8");
    EXPECT_EQ(options.threads, 3u);
    EXPECT_EQ(options.connections, 6u);
    EXPECT_EQ(options.maxBody, 4u);
    EXPECT_EQ(options.timeout, 5u);
    EXPECT_THAT(options.hostNames, ElementsAre("lab"));
    EXPECT_THAT(options.allowedOrigins, ElementsAre("http://a:1"));
    EXPECT_EQ(options.tlsCertificate, "cert.pem");
    EXPECT_EQ(options.tlsKey, "key.pem");
    EXPECT_TRUE(options.passTransport);
}

TEST(Options, HealthMetricsAndPanelAreSwitchedOffSeparately) {
    EXPECT_TRUE(parseOptions({"--no-health"}).noHealth);
    EXPECT_FALSE(parseOptions({"--no-health"}).noMetrics);
    EXPECT_TRUE(parseOptions({"--no-metrics"}).noMetrics);
    EXPECT_FALSE(parseOptions({"--no-metrics"}).noHealth);
    EXPECT_TRUE(parseOptions({"--no-panel"}).noPanel);
}

TEST(Options, AValueMayFollowAnEqualsSign) {
    EXPECT_EQ(parseOptions({"--plugin=a=b.so"}).plugin, "a=b.so");
}

TEST(Options, ALaterOptionReplacesAnEarlierOneOfTheSameName) {
    EXPECT_EQ(parseOptions({"--threads", "3", "--threads=4"}).threads, 4u);
}

TEST(Options, AnIpv6AddressLosesItsBrackets) {
    const Options options = parseOptions({"--listen", "[::1]:0"});
    EXPECT_EQ(options.address, "::1");
    EXPECT_EQ(options.port, "0");
}

TEST(Options, HostNamesAndOriginsAddUp) {
    const Options options =
        parseOptions({"--host-name", "Lab-PC.example", "--host-name=[FE80::1]", "--host-name",
                      "192.0.2.7", "--allow-origin=https://a", "--allow-origin", "app://b"});
    EXPECT_THAT(options.hostNames, ElementsAre("lab-pc.example", "fe80::1", "192.0.2.7"));
    EXPECT_THAT(options.allowedOrigins, ElementsAre("https://a", "app://b"));
}

TEST(Options, AHostNameWithAPortIsRefused) {
    for (const char* text : {"", "lab:80", "http://lab", "[::1", "[]", "lab pc", "*"}) {
        EXPECT_EQ(usageErrorOf({"--host-name", text}),
                  std::string("--host-name takes a name or address without a port, such as "
                              "lab-pc.example, not \"") +
                      text + "\".");
    }
}

TEST(Options, AnAllowedOriginMustBeASchemeAndAHost) {
    for (const char* text : {"", "null", "*", "localhost:3000", "http://a/", "http://a/page",
                             "http://", "://a", "http://user@a", "http://a:65536"}) {
        EXPECT_EQ(usageErrorOf({"--allow-origin", text}),
                  std::string("--allow-origin takes SCHEME://HOST[:PORT], such as "
                              "http://localhost:3000, not \"") +
                      text + "\".");
    }
}

TEST(Options, HelpAndVersionTakePrecedenceOverLaterArguments) {
    for (const char* option : {"--help", "-h"}) {
        for (const char* next : {"--nonsense", "--threads", "--threads=0"}) {
            EXPECT_THAT(parseOptions({option, next}).notice, StartsWith("Usage: qitrmc-host "))
                << option << " " << next;
        }
    }
    EXPECT_THAT(parseOptions({"--version", "--nonsense"}).notice, StartsWith("qitrmc-host "));
    EXPECT_THAT(parseOptions({"--version", "--threads"}).notice, StartsWith("qitrmc-host "));
}

TEST(Options, WhatIsNotAnAddressAndAPortIsRefused) {
    for (const char* text : {"8080", ":8080", "::1:8080", "[::1]", "[]:80", "[::1:80", "host:",
                             "host:port", "host:65536", "host:-1", "host:80 ", "host: 80", ""}) {
        EXPECT_THAT(usageErrorOf({"--listen", text}), HasSubstr("--listen")) << text;
    }
}

TEST(Options, NumbersOutsideTheirRangeAreRefused) {
    EXPECT_EQ(usageErrorOf({"--threads", "0"}),
              "--threads takes a number from 1 to 900, not \"0\".");
    EXPECT_EQ(usageErrorOf({"--threads", "901"}),
              "--threads takes a number from 1 to 900, not \"901\".");
    EXPECT_EQ(usageErrorOf({"--connections", "0"}),
              "--connections takes a number from 1 to 1000000, not \"0\".");
    EXPECT_EQ(usageErrorOf({"--max-body", "0"}),
              "--max-body takes a number from 1 to 4294967295, not \"0\".");
    EXPECT_EQ(usageErrorOf({"--max-body", "4294967296"}),
              "--max-body takes a number from 1 to 4294967295, not \"4294967296\".");
    EXPECT_EQ(usageErrorOf({"--timeout", "0"}),
              "--timeout takes a number from 1 to 86400, not \"0\".");
    EXPECT_EQ(usageErrorOf({"--timeout", "86401"}),
              "--timeout takes a number from 1 to 86400, not \"86401\".");
}

TEST(Options, TheLimitsOfTheRangesAreAccepted) {
    EXPECT_EQ(parseOptions({"--threads", "1"}).threads, 1u);
    EXPECT_EQ(parseOptions({"--threads", "900"}).threads, 900u);
    EXPECT_EQ(parseOptions({"--max-body", "4294967295"}).maxBody, 4294967295u);
    EXPECT_EQ(parseOptions({"--timeout", "86400"}).timeout, 86400u);
    EXPECT_EQ(parseOptions({"--listen", "host:65535"}).port, "65535");
}

TEST(Options, TextThatIsNotANumberIsRefused) {
    for (const char* text : {"", "x", "1x", " 1", "+1", "-1", "0x1", "1.0"}) {
        EXPECT_THAT(usageErrorOf({"--threads", text}), HasSubstr("--threads takes")) << text;
    }
}

TEST(Options, ASeedHas64Bits) {
    EXPECT_EQ(parseOptions({"--seed", "0"}).seed, "0");
    EXPECT_EQ(parseOptions({"--seed", "18446744073709551615"}).seed, "18446744073709551615");
    for (const char* text : {"", "x", "1x", " 1", "-1", "1.0", "18446744073709551616"}) {
        EXPECT_EQ(usageErrorOf({"--seed", text}),
                  std::string("--seed takes a number from 0 to 18446744073709551615, not \"") +
                      text + "\".");
    }
}

TEST(Options, ATimeScaleIsANumberOrTheWordCalls) {
    for (const char* text : {"calls", "0.001", "1000000", "2.5"}) {
        EXPECT_EQ(parseOptions({"--time-scale", text}).timeScale, text);
    }
    for (const char* text : {"", "x", "1x", "0", "-1", "0.0009", "1000000.1", "nan", "inf"}) {
        EXPECT_EQ(usageErrorOf({"--time-scale", text}),
                  std::string("--time-scale takes a number from 0.001 to 1000000 or the word "
                              "calls, not \"") +
                      text + "\".");
    }
}

TEST(Options, AnEmptyPathIsRefused) {
    for (const char* option :
         {"--plugin", "--chassis", "--state", "--faults", "--trace", "--tls-cert", "--tls-key"}) {
        EXPECT_EQ(usageErrorOf({option, ""}),
                  std::string(option) + " takes a path, not an empty text.");
    }
}

TEST(Options, AnEmptyTextAfterAnEqualsSignIsTheValue) {
    EXPECT_EQ(usageErrorOf({"--plugin=", "--state", "s"}),
              "--plugin takes a path, not an empty text.");
    EXPECT_EQ(usageErrorOf({"--threads=", "3"}),
              "--threads takes a number from 1 to 900, not \"\".");
}

TEST(Options, AValueMayLookLikeAnOption) {
    EXPECT_EQ(parseOptions({"--plugin", "--state"}).plugin, "--state");
    EXPECT_EQ(parseOptions({"--trace", "-"}).trace, "-");
}

TEST(Options, AMissingValueIsRefused) {
    EXPECT_EQ(usageErrorOf({"--plugin"}), "--plugin: 1 required PATH missing. Try --help.");
}

TEST(Options, UnknownArgumentsAreRefused) {
    EXPECT_EQ(usageErrorOf({"--port", "80"}), "Unknown argument \"--port\". Try --help.");
    EXPECT_EQ(usageErrorOf({"plugin.so"}), "Unknown argument \"plugin.so\". Try --help.");
    EXPECT_EQ(usageErrorOf({"-x"}), "Unknown argument \"-x\". Try --help.");
    EXPECT_EQ(usageErrorOf({""}), "Unknown argument \"\". Try --help.");
}

TEST(Options, ACertificateWithoutAKeyIsRefused) {
    const std::string expected = "--tls-cert and --tls-key are given together or not at all.";
    EXPECT_EQ(usageErrorOf({"--tls-cert", "cert.pem"}), expected);
    EXPECT_EQ(usageErrorOf({"--tls-key", "key.pem"}), expected);
}

TEST(Options, TheHelpNamesEveryOptionAndFitsATerminal) {
    const std::string help = parseOptions({"--help"}).notice;
    for (const char* option :
         {"  --listen ADDR:PORT ", "  --plugin PATH ", "  --chassis FILE ", "  --state DIR ",
          "  --faults FILE ", "  --trace FILE ", "  --seed N ", "  --time-scale X ",
          "  --threads N ", "  --max-body BYTES ", "  --timeout SECONDS ", "  --host-name NAME ",
          "  --allow-origin ORIGIN ", "  --tls-cert FILE ", "  --tls-key FILE ",
          "  --pass-transport ", "  -h,--help ", "  --version "}) {
        EXPECT_THAT(help, HasSubstr(option));
    }
    for (std::size_t line = 0; line < help.size(); line = help.find('\n', line) + 1) {
        EXPECT_LE(help.find('\n', line) - line, 100u) << help.substr(line, 100);
    }
}

}  // namespace
