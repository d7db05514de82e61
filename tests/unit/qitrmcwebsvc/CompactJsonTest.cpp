#include "qitrmcwebsvc/compactJson.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <limits>
#include <string>
#include <vector>

using namespace nQITRMCWEBSVC100;

namespace {

class CompactJsonTest : public ::testing::Test {
  protected:
    std::string printed(const std::vector<std::uint8_t>& bytes) {
        return compactJson(
            byteArray(bytes.data(), static_cast<std::uint32_t>(bytes.size()), allocator));
    }

    JsonAllocator allocator;
};

TEST_F(CompactJsonTest, PrintsBytesAsAnArrayOfNumbers) {
    EXPECT_EQ(printed({}), "[]");
    EXPECT_EQ(printed({0}), "[0]");
    EXPECT_EQ(printed({9, 10, 99, 100, 255}), "[9,10,99,100,255]");
}

TEST_F(CompactJsonTest, PrintsEveryByteAtEveryLength) {
    std::vector<std::uint8_t> bytes;
    std::string expected;
    for (int count = 0; count < 3000; ++count) {
        EXPECT_EQ(printed(bytes), "[" + expected + "]");
        const int byte = count * 7 % 256;
        bytes.push_back(static_cast<std::uint8_t>(byte));
        expected += (count == 0 ? "" : ",") + std::to_string(byte);
    }
}

TEST_F(CompactJsonTest, PrintsBytesBesideOtherValues) {
    const std::uint8_t bytes[] = {1, 2};
    JsonValue value(rapidjson::kObjectType);
    value.AddMember("a", byteArray(bytes, 2, allocator), allocator);
    value.AddMember("b", byteArray(bytes, 0, allocator), allocator);
    JsonValue array(rapidjson::kArrayType);
    array.PushBack("bytes", allocator);
    array.PushBack("text", allocator);
    array.PushBack(byteArray(bytes, 1, allocator), allocator);
    array.PushBack(3, allocator);
    value.AddMember("c", array, allocator);
    EXPECT_EQ(compactJson(value), R"({"a":[1,2],"b":[],"c":["bytes","text",[1],3]})");
}

TEST_F(CompactJsonTest, PrintsTextsOfEveryLength) {
    for (unsigned length = 0; length < 5000; length += 7) {
        const std::string text(length, 'x');
        EXPECT_EQ(compactJson(JsonValue(text.c_str(), length, allocator)), '"' + text + '"');
    }
}

TEST_F(CompactJsonTest, PrintsInfinityAndNanAsNull) {
    JsonValue array(rapidjson::kArrayType);
    array.PushBack(std::numeric_limits<double>::infinity(), allocator);
    array.PushBack(std::numeric_limits<double>::quiet_NaN(), allocator);
    array.PushBack(0.5, allocator);
    EXPECT_EQ(compactJson(array), "[null,null,0.5]");
}

}  // namespace
