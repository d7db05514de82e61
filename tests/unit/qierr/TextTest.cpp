#include <sys/mman.h>
#include <unistd.h>

#include "Records.h"

using qierr_test::expectBuffer;
using qierr_test::MeteredStatus;
using qierr_test::textOf;

namespace {

// An array text of exactly `length` bytes.
std::string textOfLength(std::size_t length) {
    return "[\"" + std::string(length - 4, 'x') + "\"]";
}

// A text of 2 GiB - 2 bytes, one page repeated by the memory map.
class EndlessText {
  public:
    EndlessText() {
        const int file = memfd_create("text", 0);
        const std::string page(pageSize, '[');
        if (file < 0 || write(file, page.data(), page.size()) != ssize_t(page.size())) {
            return;
        }
        void* room = mmap(nullptr, size, PROT_NONE, MAP_PRIVATE | MAP_ANONYMOUS, -1, 0);
        if (room != MAP_FAILED) {
            memory = static_cast<char*>(room);
            for (std::size_t at = 0; at < size && complete; at += pageSize) {
                complete = mmap(memory + at, pageSize, PROT_READ | PROT_WRITE,
                                MAP_PRIVATE | MAP_FIXED, file, 0) != MAP_FAILED;
            }
        }
        close(file);
    }
    ~EndlessText() {
        if (memory != nullptr) {
            munmap(memory, size);
        }
    }

    const char* withLength(std::size_t length) {
        if (memory == nullptr || !complete) {
            return nullptr;
        }
        memory[length] = '\0';
        return memory;
    }

  private:
    static constexpr std::size_t pageSize = 1 << 20;
    static constexpr std::size_t size = std::size_t(1) << 31;
    char* memory = nullptr;
    bool complete = true;
};

}  // namespace

TEST(DefaultRealloc, StartsWithAnEmptyObjectIn512Bytes) {
    for (std::uint32_t size : {1u, 4u, 511u, 512u}) {
        SCOPED_TRACE(size);
        qierr::Status status;
        EXPECT_EQ(qierr_Status_defaultRealloc(&status, size), 1);
        expectBuffer(status, 512, "{}");
    }
}

TEST(DefaultRealloc, RoundsUpToPowersOfTwo) {
    struct {
        std::uint32_t size, capacity;
    } const rules[] = {{513, 1024}, {1024, 1024}, {1025, 2048}, {70000, 131072}};
    for (const auto& rule : rules) {
        SCOPED_TRACE(rule.size);
        qierr::Status status;
        EXPECT_EQ(qierr_Status_defaultRealloc(&status, rule.size), 1);
        expectBuffer(status, rule.capacity, "{}");
    }
}

TEST(DefaultRealloc, KeepsTheText) {
    qierr::Status status;
    qierr_Status_setJson(&status, "{\"a\":[1]}");
    EXPECT_EQ(qierr_Status_defaultRealloc(&status, 600), 1);
    expectBuffer(status, 1024, "{\"a\":[1]}");
}

TEST(DefaultRealloc, DoesNothingWhenThereIsRoom) {
    qierr::Status status;
    qierr_Status_setJson(&status, nullptr);
    const char* buffer = status.json;
    EXPECT_EQ(qierr_Status_defaultRealloc(&status, 512), 1);
    EXPECT_EQ(status.json, buffer);
    EXPECT_EQ(status.capacity, 512u);
}

TEST(DefaultRealloc, FreesOnSizeZero) {
    qierr::Status status;
    qierr_Status_setJson(&status, nullptr);
    EXPECT_EQ(qierr_Status_defaultRealloc(&status, 0), 1);
    EXPECT_EQ(status.json, nullptr);
    EXPECT_EQ(status.capacity, 0u);
    EXPECT_EQ(qierr_Status_defaultRealloc(&status, 0), 1);
}

TEST(DefaultRealloc, RefusesSizesThatAreNegativeWhenSigned) {
    qierr::Status status;
    qierr_Status_setJson(&status, nullptr);
    for (std::uint32_t size : {0x80000000u, 0xFFFFFFFFu}) {
        EXPECT_EQ(qierr_Status_defaultRealloc(&status, size), 0);
        expectBuffer(status, 512, "{}");
    }
}

TEST(SetJson, ReplacesTheTextAndReturnsItsLastCharacter) {
    qierr::Status status;
    const char* end = qierr_Status_setJson(&status, nullptr);
    EXPECT_EQ(end, status.json + 1);
    expectBuffer(status, 512, "{}");
    EXPECT_EQ(qierr_Status_setJson(&status, "[\"long text\"]"), status.json + 12);
    expectBuffer(status, 512, "[\"long text\"]");
    EXPECT_EQ(qierr_Status_setJson(&status, "{}"), status.json + 1);
    expectBuffer(status, 512, "{}");
}

TEST(SetJson, NeedsTwoBytesBeyondTheText) {
    qierr::Status status;
    qierr_Status_setJson(&status, textOfLength(510).c_str());
    expectBuffer(status, 512, textOfLength(510));
    qierr_Status_setJson(&status, textOfLength(511).c_str());
    expectBuffer(status, 1024, textOfLength(511));
}

TEST(SetJson, FailureKeepsTheText) {
    MeteredStatus status(1);
    qierr_Status_setJson(&status, "[1]");
    EXPECT_EQ(qierr_Status_setJson(&status, textOfLength(511).c_str()), nullptr);
    expectBuffer(status, 512, "[1]");
}

TEST(SetJson, FailsWhenTheReallocFunctionMakesNoRoom) {
    qierr_Status status{0, 0, [](qierr_Status*, std::uint32_t) { return 1; }, nullptr};
    EXPECT_EQ(qierr_Status_setJson(&status, nullptr), nullptr);
    EXPECT_EQ(qierr_Status_jsonEnd(&status, 2), nullptr);
}

TEST(SetJson, RefusesAnEmptyText) {
    qierr::Status status;
    EXPECT_EQ(qierr_Status_setJson(&status, ""), nullptr);
    EXPECT_EQ(status.json, nullptr);
}

TEST(SetJson, RefusesTextsOfTwoGigabytes) {
    if (sizeof(void*) < 8) {
        GTEST_SKIP() << "no room for the text";
    }
    static std::uint32_t requested;
    requested = 0;
    qierr_Status status{0, 0,
                        [](qierr_Status*, std::uint32_t size) {
                            requested = size;
                            return 0;
                        },
                        nullptr};
    EndlessText endless;
    const char* tooLong = endless.withLength(0x7FFFFFFE);
    ASSERT_NE(tooLong, nullptr);
    EXPECT_EQ(qierr_Status_setJson(&status, tooLong), nullptr);
    EXPECT_EQ(requested, 0u);
    EXPECT_EQ(qierr_Status_setJson(&status, endless.withLength(0x7FFFFFFD)), nullptr);
    EXPECT_EQ(requested, 0x7FFFFFFFu);
}

TEST(JsonEnd, FindsTheClosingBracketAndMakesRoom) {
    qierr::Status status;
    const char* end = qierr_Status_jsonEnd(&status, 2);
    EXPECT_EQ(end, status.json + 1);
    expectBuffer(status, 512, "{}");
    qierr_Status_setJson(&status, "{\"a\":\"}\"}");
    EXPECT_EQ(qierr_Status_jsonEnd(&status, 510), status.json + 8);
    EXPECT_EQ(status.capacity, 512u);
    end = qierr_Status_jsonEnd(&status, 511);
    EXPECT_EQ(end, status.json + 8);
    expectBuffer(status, 1024, "{\"a\":\"}\"}");
}

TEST(JsonEnd, RefusesHostileLengths) {
    MeteredStatus status;
    qierr_Status_setJson(&status, nullptr);
    const int growths = status.growths;
    EXPECT_EQ(qierr_Status_jsonEnd(&status, 0x7FFFFFFE), nullptr);
    EXPECT_EQ(qierr_Status_jsonEnd(&status, 0xFFFFFFFF), nullptr);
    EXPECT_EQ(status.growths, growths);
    expectBuffer(status, 512, "{}");
}

TEST(JsonEnd, RefusesTextsThatAreNotAContainer) {
    qierr::Status status;
    for (const char* text : {"1", "\"{}\"", " {}", "{\"a\"", "[1,]"}) {
        SCOPED_TRACE(text);
        qierr_Status_setJson(&status, text);
        EXPECT_EQ(qierr_Status_jsonEnd(&status, 2), nullptr);
        EXPECT_EQ(textOf(status), text);
    }
}

TEST(GrowJson, DoublesTheRoomAndRebasesThePosition) {
    qierr::Status status;
    qierr_Status_setJson(&status, "{\"a\":[]}");
    char* pos = qierr_Status_growJson(status.json + 6, &status);
    EXPECT_EQ(pos, status.json + 6);
    expectBuffer(status, 1024, "{\"a\":[]}");
    pos = qierr_Status_growJson(pos, &status);
    EXPECT_EQ(pos, status.json + 6);
    expectBuffer(status, 2048, "{\"a\":[]}");
}

TEST(GrowJson, FailureLeavesTheTextUntouched) {
    MeteredStatus status(1);
    qierr_Status_setJson(&status, "{\"a\":[]}");
    EXPECT_EQ(qierr_Status_growJson(status.json + 6, &status), nullptr);
    expectBuffer(status, 512, "{\"a\":[]}");
}

TEST(GrowJson, RefusesToDoubleBeyondTheLimit) {
    static bool asked;
    asked = false;
    char text[] = "{}";
    qierr_Status status{0, 0x40000001,
                        [](qierr_Status*, std::uint32_t) {
                            asked = true;
                            return 1;
                        },
                        text};
    EXPECT_EQ(qierr_Status_growJson(text + 1, &status), nullptr);
    EXPECT_FALSE(asked);
    status.capacity = 0x40000000;
    EXPECT_EQ(qierr_Status_growJson(text + 1, &status), nullptr);
    EXPECT_TRUE(asked);
}

TEST(GrowJson, EndsWhenABufferDoesNotGrow) {
    char buffer[8] = "{}";
    buffer[7] = 'J';
    qierr_Status status{-1, sizeof buffer, [](qierr_Status*, std::uint32_t) { return 1; }, buffer};
    qierr_Writer writer = qierr_Status_writerAtEnd(&status);
    writer = qierr_Writer_addString(writer, "key", "value");
    EXPECT_EQ(writer.pos, nullptr);
    expectBuffer(status, 8, "{}");
}

TEST(GrowJson, RefusesABufferThatIsTooSmallForAnyText) {
    char buffer[2] = {'{', '}'};
    qierr_Status status{-1, sizeof buffer, [](qierr_Status*, std::uint32_t) { return 1; }, buffer};
    EXPECT_EQ(qierr_Status_growJson(buffer, &status), nullptr);
}

TEST(AddPosition, WritesAfterExistingMembers) {
    qierr::Status status;
    char* end = qierr_Status_setJson(&status, "{\"a\":1}");
    char* pos = qierr_Status_addPosition(&status, end, qierr_test::somewhere);
    EXPECT_EQ(textOf(status),
              "{\"a\":1,\"file\":\"src/a.cpp\",\"line\":12,\"component\":\"qitrmcsvc\"}");
    EXPECT_EQ(pos, status.json + std::strlen(status.json) - 1);
}

TEST(AddPosition, DoesNothingAtANullPosition) {
    qierr::Status status;
    qierr_Status_setJson(&status, nullptr);
    EXPECT_EQ(qierr_Status_addPosition(&status, nullptr, qierr_test::somewhere), nullptr);
    EXPECT_EQ(textOf(status), "{}");
}
