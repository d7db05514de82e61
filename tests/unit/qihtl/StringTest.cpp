#include "qihtl/String.h"

#include <gtest/gtest.h>

#include <string>
#include <utility>

#include "support/FaultyAllocator.h"

namespace {

class StringTest : public testing::Test {
  protected:
    void SetUp() override { FaultyAllocator::succeed(); }
    void TearDown() override { FaultyAllocator::succeed(); }

    static std::string text(const qihtl::String& string) {
        return std::string(string.c_str(), string.length());
    }

    qierr::Status status;
};

TEST_F(StringTest, AnUnusedStringIsEmptyAndHoldsNoMemory) {
    const std::int64_t before = FaultyAllocator::liveBlocks();
    qihtl::String string;
    EXPECT_STREQ(string.c_str(), "");
    EXPECT_EQ(string.length(), 0u);
    EXPECT_TRUE(string.empty());
    EXPECT_EQ(FaultyAllocator::liveBlocks(), before);
}

TEST_F(StringTest, AssignsAppendsAndReplaces) {
    qihtl::String string;
    string.assign("abc", &status);
    string.append("def", &status);
    EXPECT_EQ(text(string), "abcdef");
    string.replace(1, 2, "XYZ", 3, &status);
    EXPECT_EQ(text(string), "aXYZdef");
    string.replace(0, 7, "", 0, &status);
    EXPECT_EQ(text(string), "");
    string.assign("longer than what was there before", &status);
    EXPECT_EQ(text(string), "longer than what was there before");
    EXPECT_EQ(status.code, 0);
}

TEST_F(StringTest, KeepsNulBytesThatArePassedWithALength) {
    qihtl::String string;
    string.append("a\0b", 3, &status);
    EXPECT_EQ(text(string), std::string("a\0b", 3));
    EXPECT_EQ(string.c_str()[3], '\0');
    EXPECT_FALSE(string.equals("a"));
}

TEST_F(StringTest, ANullTextCountsAsEmpty) {
    qihtl::String string;
    string.append(nullptr, &status);
    EXPECT_TRUE(string.equals(""));
    EXPECT_EQ(status.code, 0);
}

TEST_F(StringTest, ComparesByLengthAndBytes) {
    qihtl::String string;
    string.assign("abc", &status);
    EXPECT_TRUE(string.equals("abc"));
    EXPECT_FALSE(string.equals("ab"));
    EXPECT_FALSE(string.equals("abd"));
    EXPECT_FALSE(string.equals("abcd"));
}

TEST_F(StringTest, ResizingPadsWithNulBytesOrTruncates) {
    qihtl::String string;
    string.assign("abc", &status);
    string.resize(5, &status);
    EXPECT_EQ(text(string), std::string("abc\0\0", 5));
    string.resize(2, &status);
    EXPECT_EQ(text(string), "ab");
}

TEST_F(StringTest, TrimsTheNamedCharactersAtEachEnd) {
    qihtl::String string;
    string.assign("\r\n a b \n\r", &status);
    string.trimStart("\r\n");
    string.trimEnd("\r\n");
    EXPECT_EQ(text(string), " a b ");
    string.assign("\n\n", &status);
    string.trimStart("\n");
    EXPECT_EQ(text(string), "");
    string.assign("\n\n", &status);
    string.trimEnd("\n");
    EXPECT_EQ(text(string), "");
}

TEST_F(StringTest, MovingLeavesTheSourceEmpty) {
    qihtl::String source;
    source.assign("abc", &status);
    qihtl::String target(std::move(source));
    EXPECT_EQ(text(target), "abc");
    EXPECT_STREQ(source.c_str(), "");
    EXPECT_EQ(source.length(), 0u);
}

TEST_F(StringTest, AFailedAllocationSetsMemoryFullAtTheAllocator) {
    qihtl::String string;
    string.assign("abc", &status);
    FaultyAllocator::failAt(0);
    string.append("a text that is too long for the room that is there", &status);
    EXPECT_EQ(status.code, -52000);
    EXPECT_EQ(text(string), "abc");
    const std::string details = status.json;
    EXPECT_NE(std::string::npos, details.find("\"error_constant\":\"qiapalerr_memoryFull\""))
        << details;
    EXPECT_NE(std::string::npos, details.find("qihtl/Allocator.h\"")) << details;
}

TEST_F(StringTest, ATextBeyondTheLimitIsMemoryFull) {
    qihtl::String string;
    string.reserve(0xFFFFFFFF, &status);
    EXPECT_EQ(status.code, -52000);
    EXPECT_EQ(string.capacity(), 0u);
}

TEST_F(StringTest, NothingIsDoneWhenTheStatusIsNegative) {
    qihtl::String string;
    string.assign("abc", &status);
    status.code = -1;
    string.assign("x", &status);
    string.append("x", &status);
    string.replace(0, 1, "x", 1, &status);
    string.resize(1, &status);
    string.reserve(1000, &status);
    EXPECT_EQ(text(string), "abc");
    EXPECT_GT(1000u, string.capacity());
    EXPECT_EQ(status.code, -1);
}

TEST_F(StringTest, AWarningDoesNotPreventAnything) {
    qihtl::String string;
    status.code = 5;
    string.assign("x", &status);
    EXPECT_EQ(text(string), "x");
}

TEST_F(StringTest, AppendingByteByByteAllocatesALogarithmicNumberOfTimes) {
    qihtl::String string;
    for (int count = 0; count < 100000; ++count) {
        string.append("x", 1, &status);
    }
    EXPECT_EQ(string.length(), 100000u);
    EXPECT_GT(30u, FaultyAllocator::requests());
}

TEST_F(StringTest, TheDestructorFreesTheText) {
    const std::int64_t before = FaultyAllocator::liveBlocks();
    {
        qihtl::String string;
        string.assign("abc", &status);
        EXPECT_EQ(FaultyAllocator::liveBlocks(), before + 1);
    }
    EXPECT_EQ(FaultyAllocator::liveBlocks(), before);
}

}  // namespace
