#include "qierr/Status.h"

#include <cstddef>
#include <cstdlib>
#include <cstring>
#include <type_traits>

#include "qierr/Writer.h"

// Separately built libraries fill this record, so its layout is fixed for both pointer sizes.
static_assert(std::is_standard_layout_v<qierr_Status> && std::is_trivial_v<qierr_Status>);
static_assert(offsetof(qierr_Status, code) == 0);
static_assert(offsetof(qierr_Status, capacity) == 4);
static_assert(offsetof(qierr_Status, reallocJson) == 8);
static_assert(offsetof(qierr_Status, json) == 8 + sizeof(void*));
static_assert(sizeof(qierr_Status) == 8 + 2 * sizeof(void*));
static_assert(sizeof(qierr::Status) == sizeof(qierr_Status));

namespace {

constexpr std::uint32_t smallestBuffer = 512;
constexpr std::uint32_t largestRequest = 0x7FFFFFFF;

void freeText(qierr_Status* status) {
    if (status->json != nullptr) {
        status->reallocJson(status, 0);
    }
}

void report(bool* textWritten, bool written) {
    if (textWritten != nullptr) {
        *textWritten = written;
    }
}

std::uint32_t roundedUp(std::uint32_t size) {
    std::uint32_t rounded = smallestBuffer;
    while (rounded < size) {
        rounded *= 2;
    }
    return rounded;
}

// Copies the text of another record; null means "{}".
bool copyText(qierr_Status* target, const qierr_Status* source) {
    return qierr_Status_setJson(target, source->json) != nullptr;
}

// Writes a new text with the position, preceded by error_constant unless that is null.
bool writePosition(qierr_Status* status, const qierr_SourcePosition& position,
                   const char* errorConstant) {
    qierr_Writer writer{qierr_Status_setJson(status, nullptr), qierr_Status_growJson, status};
    if (errorConstant != nullptr) {
        writer = qierr_Writer_addString(writer, "error_constant", errorConstant);
    }
    return qierr_Status_addPosition(status, writer.pos, position) != nullptr;
}

int setCodeWithPosition(qierr_Status* status, std::int32_t code,
                        const qierr_SourcePosition& position, const char* errorConstant,
                        bool* textWritten) {
    report(textWritten, true);
    if (qierr_Status_setCode(status, code) == 0) {
        return 0;
    }
    if (!writePosition(status, position, errorConstant)) {
        report(textWritten, false);
    }
    return 1;
}

}  // namespace

int qierr_Status_setCode(qierr_Status* status, std::int32_t code) {
    const bool replaces = status->code == 0 ? code != 0 : status->code > 0 && code < 0;
    if (!replaces) {
        return 0;
    }
    status->code = code;
    if (status->json != nullptr) {
        qierr_Status_setJson(status, nullptr);
    }
    return 1;
}

int qierr_Status_setCodeAt(qierr_Status* status, std::int32_t code,
                           const qierr_SourcePosition& position, bool* textWritten) {
    return setCodeWithPosition(status, code, position, nullptr, textWritten);
}

int qierr_Status_setCodeNamed(qierr_Status* status, std::int32_t code,
                              const qierr_SourcePosition& position, bool* textWritten) {
    return setCodeWithPosition(status, code, position, position.errorConstant, textWritten);
}

int qierr_Status_take(qierr_Status* target, qierr_Status* source, bool* textWritten) {
    report(textWritten, true);
    if (qierr_Status_setCode(target, source->code) == 0) {
        return 0;
    }
    if (target->reallocJson == source->reallocJson) {
        freeText(target);
        target->capacity = source->capacity;
        target->json = source->json;
        source->capacity = 0;
        source->json = nullptr;
    } else if (!copyText(target, source)) {
        report(textWritten, false);
    }
    return 1;
}

int qierr_Status_merge(qierr_Status* target, const qierr_Status* source, bool* textWritten) {
    report(textWritten, true);
    if (qierr_Status_setCode(target, source->code) == 0) {
        return 0;
    }
    if (source->json != nullptr && !copyText(target, source)) {
        report(textWritten, false);
    }
    return 1;
}

int qierr_Status_assign(qierr_Status* target, const qierr_Status* source) {
    if (source->capacity == 0) {
        freeText(target);
    } else if (!copyText(target, source)) {
        return 0;
    }
    target->code = source->code;
    return 1;
}

std::int32_t qierr_Status_defaultRealloc(qierr_Status* status, std::uint32_t size) {
    if (size == 0) {
        std::free(status->json);
        status->capacity = 0;
        status->json = nullptr;
        return 1;
    }
    if (size <= status->capacity) {
        return 1;
    }
    if (size > largestRequest) {
        return 0;
    }
    const std::uint32_t capacity = roundedUp(size);
    char* larger = static_cast<char*>(std::calloc(capacity, 1));
    if (larger == nullptr) {
        return 0;
    }
    const char* text = status->json != nullptr ? status->json : "{}";
    std::memcpy(larger, text, std::strlen(text));
    larger[capacity - 1] = 'J';
    std::free(status->json);
    status->capacity = capacity;
    status->json = larger;
    return 1;
}

namespace qierr {

Status::Status() noexcept : qierr_Status{0, 0, qierr_Status_defaultRealloc, nullptr} {}

Status::~Status() {
    freeText(this);
}

}  // namespace qierr
