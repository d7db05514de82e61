#include "host/Origin.h"

#include <gtest/gtest.h>
#include <netinet/in.h>
#include <sys/socket.h>
#include <unistd.h>

namespace {

using host::Authority;
using host::canonicalHost;
using host::isLoopback;
using host::isPlainAddress;
using host::localAddress;
using host::parseAuthority;
using host::parseOrigin;

TEST(CanonicalHost, IsTheSameForEverySpellingOfAHost) {
    EXPECT_EQ(canonicalHost("Lab-PC.Example"), "lab-pc.example");
    EXPECT_EQ(canonicalHost("192.0.2.7"), "192.0.2.7");
    EXPECT_EQ(canonicalHost("0:0:0:0:0:0:0:1"), "::1");
    EXPECT_EQ(canonicalHost("FE80::00A"), "fe80::a");
}

TEST(CanonicalHost, ExtractsTheIpv4AddressFromAnIpv6Address) {
    EXPECT_EQ(canonicalHost("::ffff:192.0.2.7"), "192.0.2.7");
    EXPECT_EQ(canonicalHost("::FFFF:7f00:1"), "127.0.0.1");
}

TEST(CanonicalHost, IsAbsentForWhatIsNotAHost) {
    for (const char* text :
         {"", " ", "a b", "a/b", "a@b", "[::1]", "a:80", ":", "::g", "*", "a\n", "\xC3\xA4"}) {
        EXPECT_EQ(canonicalHost(text), std::nullopt) << text;
    }
}

TEST(ParseAuthority, ReadsHostAndPort) {
    EXPECT_EQ(parseAuthority("A.b:8080", "http"), (Authority{"a.b", 8080}));
    EXPECT_EQ(parseAuthority("[::1]:0080", "http"), (Authority{"::1", 80}));
    EXPECT_EQ(parseAuthority("127.0.0.1:65535", "http"), (Authority{"127.0.0.1", 65535}));
}

TEST(ParseAuthority, AddsTheDefaultPort) {
    for (const char* text : {"a", "a:"}) {
        EXPECT_EQ(parseAuthority(text, "http"), (Authority{"a", 80}));
        EXPECT_EQ(parseAuthority(text, "https"), (Authority{"a", 443}));
        EXPECT_EQ(parseAuthority(text, "app"), (Authority{"a", 0}));
    }
    EXPECT_EQ(parseAuthority("[::1]", "http"), (Authority{"::1", 80}));
}

TEST(ParseAuthority, IsAbsentForWhatIsNotAnAuthority) {
    for (const char* text :
         {"",        ":80",         "::1",   "::1:80",    "[::1",   "::1]:80", "[]:80",
          "[a]:80",  "[127.0.0.1]", "a:b",   "a:-1",      "a:+1",   "a:65536", "a:4294967376",
          "a:80:80", "a:80 ",       " a:80", "user@a:80", "a/b:80", "[::1]80", "x[::1]:80"}) {
        EXPECT_EQ(parseAuthority(text, "http"), std::nullopt) << text;
    }
}

TEST(IsPlainAddress, RecognisesAnAddressWithAndWithoutAPort) {
    for (const char* text : {"192.0.2.7", "192.0.2.7:1", "192.0.2.7:65535"}) {
        EXPECT_TRUE(isPlainAddress(text, "192.0.2.7")) << text;
    }
}

TEST(IsPlainAddress, LeavesEverythingElseToTheParser) {
    for (const char* text : {"", "192.0.2.70", "192.0.2.7.example", "192.0.2.7:", "192.0.2.7:65536",
                             "192.0.2.7:1a", "192.0.2.7@evil", "192.0.2", "[::ffff:192.0.2.7]"}) {
        EXPECT_FALSE(isPlainAddress(text, "192.0.2.7")) << text;
    }
    EXPECT_FALSE(isPlainAddress("::1", "::1"));
    EXPECT_FALSE(isPlainAddress("", ""));
    EXPECT_FALSE(isPlainAddress(":80", ""));
}

TEST(ParseOrigin, ComparesEqualForOneOriginInTwoForms) {
    EXPECT_EQ(parseOrigin("HTTP://Lab:80"), parseOrigin("http://lab"));
    EXPECT_EQ(parseOrigin("https://lab:443"), parseOrigin("https://lab"));
    EXPECT_EQ(parseOrigin("http://[0::1]:81"), parseOrigin("http://[::1]:81"));
}

TEST(ParseOrigin, ComparesDifferentOriginsAsUnequal) {
    EXPECT_FALSE(parseOrigin("http://lab") == parseOrigin("https://lab"));
    EXPECT_FALSE(parseOrigin("http://lab:443") == parseOrigin("https://lab"));
    EXPECT_FALSE(parseOrigin("http://lab") == parseOrigin("http://lab:81"));
    EXPECT_FALSE(parseOrigin("http://lab") == parseOrigin("http://lab.example"));
}

TEST(ParseOrigin, IsAbsentForWhatIsNotAnOrigin) {
    for (const char* text :
         {"", "null", "lab", "lab:80", "http:lab", "http://", "://lab", "http://lab/",
          "http://a http://b", "http://a,b", "ht tp://lab", "http://a@b"}) {
        EXPECT_FALSE(parseOrigin(text).has_value()) << text;
    }
}

TEST(IsLoopback, RecognisesAllLoopbackAddresses) {
    for (const char* host : {"localhost", "::1", "127.0.0.1", "127.0.0.0", "127.255.255.255"}) {
        EXPECT_TRUE(isLoopback(host)) << host;
    }
    for (const char* host : {"", "126.255.255.255", "128.0.0.1", "127.1", "127.0.0.1.example",
                             "localhost.example", "::2", "0.0.0.0", "my-localhost"}) {
        EXPECT_FALSE(isLoopback(host)) << host;
    }
}

TEST(LocalAddress, IsTheAddressOfTheLocalEnd) {
    const int ipv4 = socket(AF_INET, SOCK_DGRAM, 0);
    sockaddr_in address = {};
    address.sin_family = AF_INET;
    address.sin_addr.s_addr = htonl(0x7F000203);
    ASSERT_EQ(bind(ipv4, reinterpret_cast<const sockaddr*>(&address), sizeof address), 0);
    EXPECT_EQ(localAddress(ipv4), "127.0.2.3");
    close(ipv4);
}

TEST(LocalAddress, IsEmptyWhenItIsUnknown) {
    EXPECT_EQ(localAddress(-1), "");
}

}  // namespace
