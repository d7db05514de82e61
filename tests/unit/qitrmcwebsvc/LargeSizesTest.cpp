#include <gtest/gtest.h>

#include <cstdint>
#include <new>
#include <string_view>

#include "qitrmcwebsvc/Json.h"
#include "qitrmcwebsvc/compactJson.h"
#include "qitrmcwebsvc/procedure/jsonValues.h"

using namespace nQITRMCWEBSVC100;

namespace {

// One more than 32 bits hold; 0 where a size has no more bits.
constexpr std::size_t beyond32Bits = static_cast<std::size_t>(std::uint64_t{1} << 32);

// Notes what it is asked for and gives nothing, so that no memory is needed for a large size.
class NotingAllocator {
  public:
    [[maybe_unused]] static const bool kNeedFree = true;

    void* Malloc(std::size_t size) {
        noted = size;
        return nullptr;
    }
    void* Realloc(void*, std::size_t, std::size_t size) { return Malloc(size); }
    static void Free(void*) {}

    std::size_t noted = 0;
};

using NotingPool = rapidjson::MemoryPoolAllocator<NotingAllocator>;
using NotingValue = rapidjson::GenericValue<JsonEncoding, NotingPool>;

class LargeSizesTest : public testing::Test {
  protected:
    void SetUp() override {
        if (beyond32Bits == 0) {
            GTEST_SKIP() << "sizes have 32 bits here";
        }
    }

    static constexpr std::size_t chunkSize = 64;
    NotingAllocator allocator;
    NotingPool pool{chunkSize, &allocator};
};

TEST_F(LargeSizesTest, APoolDoesNotCutSizesOf4GiBAndMore) {
    pool.Malloc(chunkSize);
    const std::size_t header = allocator.noted - chunkSize;
    for (const std::size_t size : {beyond32Bits - 8, beyond32Bits, beyond32Bits + 8,
                                   3 * beyond32Bits, 1024 * beyond32Bits}) {
        pool.Malloc(size);
        EXPECT_EQ(allocator.noted, header + size);
    }
    pool.Malloc(beyond32Bits - 1);
    EXPECT_EQ(allocator.noted, header + beyond32Bits);
    pool.Malloc(beyond32Bits + 1);
    EXPECT_EQ(allocator.noted, header + beyond32Bits + 8);
}

TEST_F(LargeSizesTest, AnArrayOf268435456ElementsAsksForAllItsBytes) {
    NotingValue array(rapidjson::kArrayType);
    array.Reserve(1u << 28, pool);
    EXPECT_GE(allocator.noted, beyond32Bits);
}

TEST_F(LargeSizesTest, ATextThatTheJsonLibraryCannotCountIsNoMemoryInsteadOfAShortText) {
    JsonAllocator jsonAllocator;
    EXPECT_THROW(textValue(std::string_view("x", beyond32Bits + 1), jsonAllocator), std::bad_alloc);
    EXPECT_THROW(textValue(std::string_view("x", beyond32Bits - 1), jsonAllocator), std::bad_alloc);
}

TEST_F(LargeSizesTest, MoreElementsThanTheJsonLibraryCanCountAreNoMemoryInsteadOfFew) {
    JsonAllocator jsonAllocator;
    JsonValue array(rapidjson::kArrayType);
    EXPECT_THROW(reserveElements(array, beyond32Bits + 1, jsonAllocator), std::bad_alloc);
}

// The bytes of so many elements are 0 in 32 bits. In 64 bits there may be memory for them.
TEST(LargeArrays, ElementsWhoseBytesOverflow32BitsAreNoMemoryInsteadOfNone) {
    if (beyond32Bits != 0) {
        GTEST_SKIP() << "sizes have 64 bits here";
    }
    JsonAllocator jsonAllocator;
    JsonValue array(rapidjson::kArrayType);
    EXPECT_THROW(reserveElements(array, 1u << 28, jsonAllocator), std::bad_alloc);
}

// The text is far shorter than it claims: it must be refused before it is read.
TEST(LargeTexts, ATextWhoseRoomOverflows32BitsIsNotWrittenBeyondTheBuffer) {
    constexpr rapidjson::SizeType length = 715827883;
    EXPECT_THROW(compactJson(JsonValue("x", length)), std::bad_alloc);
    JsonAllocator allocator;
    JsonValue object(rapidjson::kObjectType);
    object.AddMember(JsonValue("x", length), JsonValue(), allocator);
    EXPECT_THROW(compactJson(object), std::bad_alloc);
}

}  // namespace
