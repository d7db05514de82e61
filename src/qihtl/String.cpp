#include "qihtl/String.h"

#include <cstring>

namespace qihtl {

namespace {

// A longer text is reported as an allocation failure. The limit keeps every sum of two lengths
// within 32 bits.
constexpr std::uint32_t maximumLength = 0x7FFFFFFE;

std::uint32_t boundedLength(const char* text) {
    const std::size_t length = text == nullptr ? 0 : std::strlen(text);
    return length > maximumLength ? maximumLength + 1 : static_cast<std::uint32_t>(length);
}

bool occursIn(const char* characters, char wanted) {
    return wanted != '\0' && std::strchr(characters, wanted) != nullptr;
}

}  // namespace

String::~String() {
    qihtl_realloc(pointer, 0);
}

String::String(String&& source) noexcept
    : pointer(source.pointer), room(source.room), used(source.used) {
    source.pointer = nullptr;
    source.room = 0;
    source.used = 0;
}

bool String::equals(const char* text) const noexcept {
    return std::strlen(text) == used && std::memcmp(c_str(), text, used) == 0;
}

void String::clear() noexcept {
    used = 0;
    if (pointer != nullptr) {
        pointer[0] = '\0';
    }
}

void String::shrink() noexcept {
    if (pointer == nullptr || used == room) {
        return;
    }
    char* moved = static_cast<char*>(qihtl_realloc(pointer, std::size_t{used} + 1));
    if (moved != nullptr) {
        pointer = moved;
        room = used;
    }
}

bool String::setRoom(std::uint32_t wanted, qierr_Status* status) {
    char* moved = static_cast<char*>(qihtl_realloc(pointer, std::size_t{wanted} + 1));
    if (moved == nullptr) {
        qihtl_reportMemoryFull(status);
        return false;
    }
    if (pointer == nullptr) {
        moved[0] = '\0';
    }
    pointer = moved;
    room = wanted;
    return true;
}

bool String::grow(std::uint64_t needed, qierr_Status* status) {
    if (needed > maximumLength) {
        qihtl_reportMemoryFull(status);
        return false;
    }
    if (pointer != nullptr && needed <= room) {
        return true;
    }
    return setRoom(qihtl_grownCapacity(room, needed, sizeof(char)), status);
}

void String::reserve(std::uint32_t wanted, qierr_Status* status) {
    if (status->code < 0 || (pointer != nullptr && wanted <= room)) {
        return;
    }
    if (wanted > maximumLength) {
        qihtl_reportMemoryFull(status);
        return;
    }
    setRoom(wanted, status);
}

void String::resize(std::uint32_t wanted, qierr_Status* status) {
    if (status->code < 0 || !grow(wanted, status)) {
        return;
    }
    if (wanted > used) {
        std::memset(pointer + used, 0, wanted - used);
    }
    used = wanted;
    pointer[used] = '\0';
}

void String::assign(const char* text, qierr_Status* status) {
    replace(0, used, text, boundedLength(text), status);
}

void String::assign(const char* text, std::uint32_t textLength, qierr_Status* status) {
    replace(0, used, text, textLength, status);
}

void String::append(const char* text, qierr_Status* status) {
    replace(used, 0, text, boundedLength(text), status);
}

void String::append(const char* text, std::uint32_t textLength, qierr_Status* status) {
    replace(used, 0, text, textLength, status);
}

void String::replace(std::uint32_t position, std::uint32_t count, const char* text,
                     std::uint32_t textLength, qierr_Status* status) {
    const std::uint32_t kept = used - count;
    if (status->code < 0 || !grow(std::uint64_t{kept} + textLength, status)) {
        return;
    }
    char* place = pointer + position;
    std::memmove(place + textLength, place + count, used - position - count);
    if (textLength != 0) {
        std::memcpy(place, text, textLength);
    }
    used = kept + textLength;
    pointer[used] = '\0';
}

void String::trimStart(const char* characters) noexcept {
    std::uint32_t count = 0;
    while (count < used && occursIn(characters, pointer[count])) {
        ++count;
    }
    if (count != 0) {
        used -= count;
        std::memmove(pointer, pointer + count, used);
        pointer[used] = '\0';
    }
}

void String::trimEnd(const char* characters) noexcept {
    while (used != 0 && occursIn(characters, pointer[used - 1])) {
        --used;
        pointer[used] = '\0';
    }
}

}  // namespace qihtl
