#include "qitrmcwebsvc/SingleResponse.h"

#include <gtest/gtest.h>

#include <optional>
#include <string>
#include <utility>

#include "qierr/Exception.h"
#include "support/PlainDescriptions.h"

using namespace nQITRMCWEBSVC100;

namespace {

class SingleResponseTest : public ::testing::Test {
  protected:
    static std::string textOf(const JsonValue& value) {
        JsonBuffer buffer;
        JsonWriter writer(buffer);
        value.Accept(writer);
        return buffer.GetString();
    }

    std::string errorOf(std::int32_t code) {
        SingleResponse response(&allocator);
        qierr::Status status;
        qierr_Status_setCode(&status, code);
        response.setError(status);
        return textOf(response.getValue());
    }

    JsonAllocator allocator;
};

TEST_F(SingleResponseTest, StartsAsAnEnvelopeWithANullId) {
    SingleResponse response(&allocator);
    EXPECT_EQ(textOf(response.getValue()), "{\"jsonrpc\":\"2.0\",\"id\":null}");
}

TEST_F(SingleResponseTest, CopiesItsIdDeeply) {
    std::optional<SingleResponse> response;
    {
        JsonDocument request;
        request.Parse("{\"a\":[\"a text that is too long to be kept in a value itself\"]}");
        response.emplace(request, &allocator);
    }
    EXPECT_EQ(textOf(response->getValue()),
              "{\"jsonrpc\":\"2.0\",\"id\":{\"a\":[\"a text that is too long to be kept in a "
              "value itself\"]}}");
}

TEST_F(SingleResponseTest, TakesAResult) {
    SingleResponse response(&allocator);
    JsonValue value("done");
    response.setResult(std::move(value));
    EXPECT_TRUE(value.IsNull());
    EXPECT_EQ(textOf(response.getValue()), "{\"jsonrpc\":\"2.0\",\"id\":null,\"result\":\"done\"}");
}

TEST_F(SingleResponseTest, TurnsAnEmptyResultIntoAnObject) {
    SingleResponse response(&allocator);
    response.setEmptyResult();
    EXPECT_EQ(textOf(response.getValue()), "{\"jsonrpc\":\"2.0\",\"id\":null,\"result\":{}}");
}

TEST_F(SingleResponseTest, ReportsJsonRpcCodesWithoutData) {
    for (const char* code : {"-32700", "-32603", "-32602", "-32601", "-32600", "-32000"}) {
        EXPECT_EQ(errorOf(std::stoi(code)),
                  std::string("{\"jsonrpc\":\"2.0\",\"id\":null,\"error\":{\"code\":") + code +
                      ",\"message\":\"" + code + "\"}}");
    }
}

TEST_F(SingleResponseTest, WrapsEveryOtherCodePositiveOnesIncluded) {
    for (const char* code : {"-32001", "-32604", "-32599", "-250800", "-1", "0", "5"}) {
        EXPECT_EQ(errorOf(std::stoi(code)),
                  std::string("{\"jsonrpc\":\"2.0\",\"id\":null,\"error\":{\"code\":-32000,"
                              "\"message\":\"-32000\",\"data\":{\"qitrmc_code\":") +
                      code + ",\"qitrmc_message\":\"" + code + "\"}}}");
    }
}

TEST_F(SingleResponseTest, AddsNothingWhenTheStatusCannotBeDescribed) {
    for (int failing : {0, 1}) {
        SingleResponse response(&allocator);
        qierr::Status status;
        qierr_Status_setCode(&status, -1);
        plainDescriptions::failNext(1, failing);
        EXPECT_THROW(response.setError(status), qierr::Exception);
        EXPECT_EQ(textOf(response.getValue()), "{\"jsonrpc\":\"2.0\",\"id\":null}");
    }
}

}  // namespace
