#pragma once

#include <gtest/gtest.h>

#include <cstring>
#include <string>

#include "qierr/Writer.h"

namespace qierr_test {

inline std::string textOf(const qierr_Status& status) {
    return status.json != nullptr ? status.json : "(null)";
}

// Checks the format of the whole buffer: the text and its NUL, zero bytes, and the end marker.
inline void expectBuffer(const qierr_Status& status, std::uint32_t capacity,
                         const std::string& text) {
    ASSERT_EQ(status.capacity, capacity);
    ASSERT_NE(status.json, nullptr);
    std::string expected(capacity, '\0');
    expected.replace(0, text.size(), text);
    expected[capacity - 1] = 'J';
    EXPECT_EQ(std::string(status.json, capacity), expected);
}

// A record that can be set to refuse memory. Its buffers are those of the default allocation, so it
// serves as a record of another program too.
class MeteredStatus : public qierr_Status {
  public:
    explicit MeteredStatus(int growthsLeft = 1000)
        : qierr_Status{0, 0, reallocate, nullptr}, growthsLeft(growthsLeft) {}
    ~MeteredStatus() {
        if (json != nullptr) {
            reallocJson(this, 0);
        }
    }
    MeteredStatus(const MeteredStatus&) = delete;
    MeteredStatus& operator=(const MeteredStatus&) = delete;

    int growthsLeft;
    int growths = 0;

  private:
    static std::int32_t reallocate(qierr_Status* status, std::uint32_t size) {
        MeteredStatus* self = static_cast<MeteredStatus*>(status);
        if (size > self->capacity) {
            if (self->growthsLeft == 0) {
                return 0;
            }
            --self->growthsLeft;
            ++self->growths;
        }
        return qierr_Status_defaultRealloc(status, size);
    }
};

constexpr qierr_SourcePosition somewhere{"src/a.cpp", 12, "qitrmcsvc", "qiapalerr_memoryFull"};

inline const char* const somewhereText =
    "{\"file\":\"src/a.cpp\",\"line\":12,\"component\":\"qitrmcsvc\"}";

}  // namespace qierr_test
