#include "host/RpcError.h"

#include <gtest/gtest.h>

namespace {

using host::hasRpcError;

TEST(RpcError, IsFoundInASingleResponse) {
    EXPECT_TRUE(hasRpcError(R"({"jsonrpc":"2.0","id":1,"error":{"code":-32601}})"));
    EXPECT_TRUE(hasRpcError(R"({"jsonrpc":"2.0","id":null,"error":{"code":-32700}})"));
}

TEST(RpcError, IsFoundInAnyResponseOfABatch) {
    EXPECT_TRUE(hasRpcError(R"([{"id":1,"result":{}},{"id":2,"error":{}}])"));
    EXPECT_TRUE(hasRpcError(R"([{"id":1,"error":{}},{"id":2,"result":{}}])"));
    EXPECT_FALSE(hasRpcError(R"([{"id":1,"result":{}},{"id":2,"result":{}}])"));
}

TEST(RpcError, IsNotAMemberOfAResultNorATextInIt) {
    EXPECT_FALSE(hasRpcError(R"({"id":1,"result":{"error":1}})"));
    EXPECT_FALSE(hasRpcError(R"({"id":"\"error\":","result":{"value":"\"error\":{}"}})"));
    EXPECT_FALSE(hasRpcError(R"([{"id":1,"result":{"error":{"error":1}}}])"));
    EXPECT_FALSE(hasRpcError(R"([{"id":1,"result":{"value":[{"error":1}]}}])"));
}

TEST(RpcError, IsFoundBehindIdsThatLookLikeAResult) {
    EXPECT_TRUE(hasRpcError(R"({"id":"result","error":{}})"));
    EXPECT_TRUE(hasRpcError(R"({"id":"\"result\":","error":{}})"));
    EXPECT_TRUE(hasRpcError(R"({"id":{"result":1},"error":{}})"));
    EXPECT_TRUE(hasRpcError(R"({"id":[{"result":1}],"error":{}})"));
    EXPECT_TRUE(hasRpcError(R"({"error":{"data":{"result":1}},"id":1})"));
    EXPECT_TRUE(hasRpcError(R"({"error":1,"result":1})"));
    EXPECT_TRUE(hasRpcError(R"({"id":")" + std::string(1000, 'x') + R"(","error":{}})"));
}

TEST(RpcError, IsNotInWhatIsNoResponse) {
    EXPECT_FALSE(hasRpcError(""));
    EXPECT_FALSE(hasRpcError("error"));
    EXPECT_FALSE(hasRpcError(std::string(1000000, '[')));
}

// The scan of a result of a megabyte that is cut off would not see the error behind it.
TEST(RpcError, IsNotLookedForBehindAResult) {
    EXPECT_FALSE(hasRpcError(R"({"id":1,"result":{},"error":{}})"));
}

}  // namespace
