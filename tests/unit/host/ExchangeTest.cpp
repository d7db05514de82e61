#include "host/Exchange.h"

#include <gtest/gtest.h>

namespace {

using host::Exchange;
using host::Gate;

constexpr std::uint32_t maxBody = 10;
constexpr std::size_t mebibyte = 1024 * 1024;

TEST(Exchange, IsInFlightUntilItIsDestroyed) {
    Gate gate;
    {
        const Exchange exchange(gate, maxBody);
        EXPECT_FALSE(gate.waitUntilEmpty(std::chrono::milliseconds(0)));
    }
    EXPECT_TRUE(gate.waitUntilEmpty(std::chrono::milliseconds(0)));
}

TEST(Exchange, KeepsABodyUpToTheLimit) {
    Gate gate;
    Exchange exchange(gate, maxBody);
    exchange.begin("http", "POST", "/qitrmc/Call", "10");
    EXPECT_TRUE(exchange.take("01234", 5));
    EXPECT_TRUE(exchange.take("56789", 5));
    EXPECT_FALSE(exchange.isAnswered());
    EXPECT_EQ(exchange.response().body, "0123456789");
}

TEST(Exchange, RefusesADeclaredLengthAboveTheLimit) {
    Gate gate;
    for (const char* length : {"11", "4294967306", "99999999999999999999999999"}) {
        Exchange exchange(gate, maxBody);
        exchange.begin("http", "POST", "/qitrmc/Call", length);
        EXPECT_TRUE(exchange.isAnswered()) << length;
        EXPECT_EQ(exchange.response().code, 413);
        EXPECT_EQ(exchange.response().output,
                  "The request body is too large: at most 10 bytes are taken.\n");
    }
}

TEST(Exchange, RefusesABodyThatGrowsAboveTheLimitAndDiscardsIt) {
    Gate gate;
    Exchange exchange(gate, maxBody);
    exchange.begin("http", "POST", "/qitrmc/Call", nullptr);
    EXPECT_TRUE(exchange.take("0123456789", 10));
    EXPECT_TRUE(exchange.take("x", 1));
    EXPECT_EQ(exchange.response().code, 413);
    EXPECT_EQ(exchange.response().body, "");
}

TEST(Exchange, DropsAClientThatSendsFarMoreThanTheLimit) {
    Gate gate;
    Exchange exchange(gate, maxBody);
    exchange.begin("http", "POST", "/qitrmc/Call", nullptr);
    const std::string piece(mebibyte, 'x');
    for (int i = 0; i < 64; ++i) {
        EXPECT_TRUE(exchange.take(piece.data(), piece.size()));
    }
    EXPECT_FALSE(exchange.take("x", 1));
}

TEST(Exchange, RefusesPathsOutsideTheService) {
    Gate gate;
    Exchange exchange(gate, maxBody);
    exchange.begin("http", "POST", "/elsewhere", nullptr);
    EXPECT_TRUE(exchange.isAnswered());
    EXPECT_EQ(exchange.response().code, 404);
    EXPECT_EQ(exchange.response().type, "text/plain");
    EXPECT_EQ(exchange.response().output,
              "There is nothing here. The service is at /qitrmc/Call.\n");
}

TEST(Exchange, RefusesWhatThePolicyRefusesOnEveryPath) {
    Gate gate;
    for (const char* path : {"/qitrmc/Call", "/elsewhere"}) {
        Exchange exchange(gate, maxBody);
        exchange.admit({"Not here.\n", false, {}});
        exchange.begin("http", "POST", path, "11");
        EXPECT_TRUE(exchange.isAnswered());
        EXPECT_EQ(exchange.response().code, 403);
        EXPECT_EQ(exchange.response().type, "text/plain");
        EXPECT_EQ(exchange.response().output, "Not here.\n");
    }
}

TEST(Exchange, AnswersAPreflightWithHeadersOnly) {
    Gate gate;
    Exchange exchange(gate, maxBody);
    exchange.admit({"", true, {{"Vary", "Origin"}}});
    exchange.begin("http", "OPTIONS", "/qitrmc/Call", nullptr);
    EXPECT_TRUE(exchange.isAnswered());
    EXPECT_EQ(exchange.response().code, 204);
    EXPECT_EQ(exchange.response().type, "");
    EXPECT_EQ(exchange.response().output, "");
    ASSERT_EQ(exchange.headers().size(), 1u);
    EXPECT_STREQ(exchange.headers()[0].name, "Vary");
}

TEST(Exchange, KeepsTheHeadersOfThePolicyWhenItRefusesTheRequestLater) {
    Gate gate;
    Exchange exchange(gate, maxBody);
    exchange.admit({"", false, {{"Vary", "Origin"}}});
    exchange.begin("http", "POST", "/elsewhere", nullptr);
    EXPECT_EQ(exchange.response().code, 404);
    ASSERT_EQ(exchange.headers().size(), 1u);
    EXPECT_EQ(exchange.headers()[0].value, "Origin");
}

TEST(Exchange, RefusesEveryRequestOnceTheGateIsClosed) {
    Gate gate;
    gate.close();
    Exchange exchange(gate, maxBody);
    exchange.begin("http", "POST", "/qitrmc/Call", nullptr);
    EXPECT_TRUE(exchange.isAnswered());
    EXPECT_EQ(exchange.response().code, 503);
    EXPECT_EQ(exchange.response().output, "The server is stopping.\n");
}

}  // namespace
