#include "qi/dsc/exceptions.h"

#include <gtest/gtest.h>

using namespace qi::dsc::exception;

namespace {

// Throws a class and catches it as its base.
template <typename Thrown, typename Base = Exception>
void expectThrown(const char* what, std::uint32_t code) {
    try {
        throw Thrown(17, "some.h");
    } catch (const Base& error) {
        EXPECT_STREQ(error.what(), what);
        EXPECT_EQ(error.code(), code);
        EXPECT_EQ(error.line, 17);
        EXPECT_STREQ(error.file, "some.h");
        EXPECT_STREQ(static_cast<const std::exception&>(error).what(), what);
    }
}

}  // namespace

TEST(DscExceptions, CarryTheirTextsAndCodes) {
    expectThrown<Exception>("unspecified exception", 0xFFFFFFFF);
    expectThrown<OutOfRange>("Out of range", 0x8ABC7007);
    expectThrown<BoundExceeded>("A request was made that would exceed the bounds", 0xFFFFFFFF);
    expectThrown<BufferOverflow>("Buffer overflowed", 0xFFFFFFFF);
    expectThrown<DeserializationError>("Failed to deserialize", 0xFFFFFFFF);
}

TEST(DscExceptions, DerivedClassesCarryTheSameAsTheirBases) {
    expectThrown<OutOfRange2, OutOfRange>("Out of range", 0x8ABC7007);
    expectThrown<BoundExceeded2, BoundExceeded>("A request was made that would exceed the bounds",
                                                0xFFFFFFFF);
    expectThrown<InvalidArgument2, InvalidArgument>("unspecified exception", 0xFFFFFFFF);
    expectThrown<InvalidSequence>("unspecified exception", 0xFFFFFFFF);
    expectThrown<InvalidLocale>("unspecified exception", 0xFFFFFFFF);
}
