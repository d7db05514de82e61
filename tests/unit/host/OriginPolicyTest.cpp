#include "host/OriginPolicy.h"

#include <gmock/gmock.h>

namespace {

using host::OriginPolicy;
using host::Source;
using host::Verdict;
using testing::HasSubstr;

Source sourceOf(const std::vector<std::string_view>& hosts,
                const std::vector<std::string_view>& origins = {}) {
    Source source;
    source.method = "POST";
    source.localAddress = "192.0.2.7";
    source.hosts = hosts;
    source.origins = origins;
    return source;
}

class OriginPolicyTest : public testing::Test {
  protected:
    std::string refusalOf(const Source& source) const { return policy.judge(source).refusal; }

    const OriginPolicy policy{"http", {"lab-pc", "::"}, {"https://app.example", "http://ui:3000"}};
};

TEST_F(OriginPolicyTest, ClientsWithoutAnOriginPassWithoutAddedHeaders) {
    for (const char* host : {"127.0.0.1:8080", "127.9.9.9", "localhost:1", "LocalHost",
                             "[::1]:8080", "[::ffff:127.0.0.1]", "192.0.2.7:8080",
                             "[::ffff:192.0.2.7]", "lab-pc:80", "LAB-PC", "[::]:8080"}) {
        const Verdict verdict = policy.judge(sourceOf({host}));
        EXPECT_EQ(verdict.refusal, "") << host;
        EXPECT_TRUE(verdict.headers.empty()) << host;
        EXPECT_FALSE(verdict.isPreflight) << host;
    }
}

TEST_F(OriginPolicyTest, AnUnknownHostNameIsRefusedWithTheOptionThatAllowsIt) {
    EXPECT_EQ(refusalOf(sourceOf({"Evil.example:8080"})),
              "Requests to the host name evil.example are not taken. Use an address of this "
              "machine, or start the host with --host-name evil.example.\n");
    for (const char* host : {"192.0.2.8", "127.0.0.1.evil.example", "localhost.evil.example",
                             "lab-pc.example", "127.1", "[fe80::1]"}) {
        EXPECT_THAT(refusalOf(sourceOf({host})), HasSubstr("--host-name")) << host;
    }
}

TEST_F(OriginPolicyTest, AMalformedHostIsRefused) {
    EXPECT_EQ(refusalOf(sourceOf({"a b"})),
              "The Host \"a b\" is not a name or address. Send the one that stands in the URL.\n");
    for (const char* host : {"", ":80", "[::1", "127.0.0.1@evil", "localhost/", "localhost:x"}) {
        EXPECT_THAT(refusalOf(sourceOf({host})), HasSubstr("not a name or address")) << host;
    }
}

TEST_F(OriginPolicyTest, APageThatUsesDnsRebindingIsRefusedForItsHost) {
    EXPECT_THAT(refusalOf(sourceOf({"evil.example:8080"}, {"http://evil.example:8080"})),
                HasSubstr("--host-name evil.example"));
}

TEST_F(OriginPolicyTest, AnAllowedOriginDoesNotExcuseAForeignHost) {
    EXPECT_THAT(refusalOf(sourceOf({"evil.example"}, {"https://app.example"})),
                HasSubstr("--host-name evil.example"));
}

TEST_F(OriginPolicyTest, WithoutAHostOnlyRequestsWithoutAnOriginPass) {
    EXPECT_EQ(refusalOf(sourceOf({})), "");
    EXPECT_NE(refusalOf(sourceOf({}, {"http://127.0.0.1"})), "");
    EXPECT_EQ(refusalOf(sourceOf({}, {"https://app.example"})), "");
}

TEST_F(OriginPolicyTest, ItsOwnOriginPassesWithoutAddedHeaders) {
    const struct {
        const char* host;
        const char* origin;
    } cases[] = {
        {"127.0.0.1:8080", "http://127.0.0.1:8080"}, {"localhost:8080", "http://LOCALHOST:8080"},
        {"localhost", "http://localhost:80"},        {"localhost:80", "http://localhost"},
        {"[::1]:8080", "http://[0:0::1]:8080"},      {"lab-pc:8080", "http://lab-pc:8080"},
        {"192.0.2.7:9", "HTTP://192.0.2.7:9"}};
    for (const auto& [host, origin] : cases) {
        const Verdict verdict = policy.judge(sourceOf({host}, {origin}));
        EXPECT_EQ(verdict.refusal, "") << origin;
        EXPECT_TRUE(verdict.headers.empty()) << origin;
    }
}

TEST_F(OriginPolicyTest, AForeignOriginIsRefusedWithTheOptionThatAllowsIt) {
    EXPECT_EQ(refusalOf(sourceOf({"127.0.0.1:8080"}, {"http://evil.example"})),
              "Requests of web pages from http://evil.example are not taken. To take them, start "
              "the host with --allow-origin http://evil.example.\n");
    for (const char* origin :
         {"http://127.0.0.1", "http://127.0.0.1:8081", "https://127.0.0.1:8080",
          "http://localhost:8080", "http://127.0.0.1.evil.example:8080", "https://app.example:444",
          "http://app.example", "https://app.example.evil"}) {
        EXPECT_THAT(refusalOf(sourceOf({"127.0.0.1:8080"}, {origin})), HasSubstr("--allow-origin"))
            << origin;
    }
}

TEST_F(OriginPolicyTest, AnOriginThatCannotBeAllowedIsRefused) {
    EXPECT_EQ(refusalOf(sourceOf({"localhost"}, {"null"})),
              "Requests with the Origin \"null\" are not taken. Serve the page from a web server, "
              "and start the host with --allow-origin and the origin of that server.\n");
    for (const char* origin :
         {"", "Null", "http://localhost https://app.example", "https://", "https://app.example/"}) {
        EXPECT_THAT(refusalOf(sourceOf({"localhost"}, {origin})), HasSubstr("with the Origin"))
            << origin;
    }
}

TEST_F(OriginPolicyTest, MoreThanOneHostOrOriginIsRefusedWhateverTheyAre) {
    const std::string text = "A request has one Host and at most one Origin.\n";
    EXPECT_EQ(refusalOf(sourceOf({"localhost", "localhost"})), text);
    EXPECT_EQ(refusalOf(sourceOf({"localhost", "evil"})), text);
    EXPECT_EQ(refusalOf(sourceOf({"localhost"}, {"https://app.example", "http://evil"})), text);
    EXPECT_EQ(refusalOf(sourceOf({"localhost"}, {"http://localhost", "http://localhost"})), text);
}

std::vector<std::string> linesOf(const Verdict& verdict) {
    std::vector<std::string> lines;
    for (const host::Header& header : verdict.headers) {
        lines.push_back(header.name + (": " + header.value));
    }
    return lines;
}

TEST_F(OriginPolicyTest, AnAllowedOriginIsNamedInTheResponseAsItWasSent) {
    const Verdict verdict = policy.judge(sourceOf({"localhost"}, {"HTTPS://app.example:443"}));
    EXPECT_EQ(verdict.refusal, "");
    EXPECT_FALSE(verdict.isPreflight);
    EXPECT_THAT(linesOf(verdict),
                testing::ElementsAre("Access-Control-Allow-Origin: HTTPS://app.example:443",
                                     "Vary: Origin"));
}

TEST_F(OriginPolicyTest, APreflightGetsTheHeadersItAsksFor) {
    Source source = sourceOf({"localhost"}, {"http://ui:3000"});
    source.method = "OPTIONS";
    source.wantedMethod = "POST";
    const Verdict plain = policy.judge(source);
    EXPECT_TRUE(plain.isPreflight);
    EXPECT_THAT(linesOf(plain),
                testing::ElementsAre("Access-Control-Allow-Origin: http://ui:3000", "Vary: Origin",
                                     "Access-Control-Allow-Methods: POST",
                                     "Access-Control-Allow-Headers: Content-Type",
                                     "Access-Control-Max-Age: 600"));
    source.wantedHeaders = "content-type,x-token";
    EXPECT_THAT(linesOf(policy.judge(source)),
                testing::Contains("Access-Control-Allow-Headers: content-type,x-token"));
}

TEST_F(OriginPolicyTest, OnlyOptionsWithAWantedMethodIsAPreflight) {
    Source source = sourceOf({"localhost"}, {"http://ui:3000"});
    source.method = "OPTIONS";
    EXPECT_FALSE(policy.judge(source).isPreflight);
    source.method = "POST";
    source.wantedMethod = "POST";
    EXPECT_FALSE(policy.judge(source).isPreflight);
}

TEST_F(OriginPolicyTest, APreflightOfAForeignOriginIsRefused) {
    Source source = sourceOf({"localhost"}, {"http://evil.example"});
    source.method = "OPTIONS";
    source.wantedMethod = "POST";
    EXPECT_THAT(refusalOf(source), HasSubstr("--allow-origin http://evil.example"));
    EXPECT_FALSE(policy.judge(source).isPreflight);
}

TEST(OriginPolicy, BehindTlsItsOwnOriginIsAnHttpsOrigin) {
    const OriginPolicy policy("https", {}, {});
    EXPECT_EQ(policy.judge(sourceOf({"localhost"}, {"https://localhost:443"})).refusal, "");
    EXPECT_NE(policy.judge(sourceOf({"localhost"}, {"http://localhost:443"})).refusal, "");
    EXPECT_NE(policy.judge(sourceOf({"localhost:80"}, {"http://localhost"})).refusal, "");
}

TEST(Source, ReadsItsHeadersInAnyLetterCase) {
    Source source;
    source.takeHeader("HOST", "a");
    source.takeHeader("host", "b");
    source.takeHeader("oRIGIN", "null");
    source.takeHeader("access-control-request-method", "POST");
    source.takeHeader("Access-Control-Request-Headers", "x");
    source.takeHeader("X-Forwarded-Host", "c");
    EXPECT_EQ(source.hosts, (std::vector<std::string_view>{"a", "b"}));
    EXPECT_EQ(source.origins, (std::vector<std::string_view>{"null"}));
    EXPECT_EQ(source.wantedMethod, "POST");
    EXPECT_EQ(source.wantedHeaders, "x");
}

}  // namespace
