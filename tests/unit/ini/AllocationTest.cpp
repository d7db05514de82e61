#include <cstdlib>
#include <new>

#include "TemporaryIni.h"

namespace {

// How many allocations succeed before one fails; negative: all do.
long allocationsLeft = -1;

}  // namespace

void* operator new(std::size_t size, const std::nothrow_t&) noexcept {
    if (allocationsLeft == 0) {
        return nullptr;
    }
    allocationsLeft -= allocationsLeft > 0 ? 1 : 0;
    return std::malloc(size);
}

void* operator new(std::size_t size) {
    if (void* memory = operator new(size, std::nothrow)) {
        return memory;
    }
    throw std::bad_alloc();
}

// Not inlined, since GCC then warns of a free() of what `new` has returned.
[[gnu::noinline]] void operator delete(void* memory) noexcept {
    std::free(memory);
}

[[gnu::noinline]] void operator delete(void* memory, std::size_t) noexcept {
    std::free(memory);
}

using namespace ini_test;

TEST(IniAllocation, CreateReturnsNullWithoutMemory) {
    allocationsLeft = 0;
    IniFile* file = IniFile_create();
    allocationsLeft = -1;
    EXPECT_EQ(file, nullptr);
}

TEST(IniAllocation, LoadFailsCleanlyAtEachAllocation) {
    const TemporaryFile source(
        "[a section of some length]\nT Line1=a value of some length\nT Line2=another one\n"
        "b=" +
        std::string(600, 'v') + "\n[second]\nc=1\n");
    const File file = loaded("[kept]\nk=1\n");
    std::int32_t result = -12;
    long failures = 0;
    for (long allowed = 0; result == -12; ++allowed) {
        allocationsLeft = allowed;
        result = IniFile_load(file.get(), source.name());
        allocationsLeft = -1;
        if (result != 0) {
            ASSERT_EQ(result, -12) << allowed;
            ASSERT_EQ(contents(*file), (Texts{"[kept]", "k=1"})) << allowed;
            ++failures;
        }
    }
    EXPECT_GT(failures, 10);
    EXPECT_EQ(file->sections.size(), 2u);
}

TEST(IniAllocation, ReadingAValueNeedsNoMemory) {
    const File file =
        loaded("[A section name beyond any small buffer]\nA key name of such a kind=5\n");
    std::uint32_t value = 0;
    allocationsLeft = 0;
    const std::int32_t result = IniFile_getInt(file.get(), "a section name beyond any small buffer",
                                               "a key name of such a kind", &value);
    allocationsLeft = -1;
    EXPECT_EQ(result, 1);
    EXPECT_EQ(value, 5u);
}
