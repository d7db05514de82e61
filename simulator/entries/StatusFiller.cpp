#include "entries/StatusFiller.h"

#include <cstring>
#include <new>

namespace simulator {

namespace {

constexpr std::string_view emptyText = "{}";
// A NUL after the text, and the end marker.
constexpr std::size_t framing = 2;

bool putText(qierr_Status& status, std::string_view text) noexcept {
    const std::size_t needed = text.size() + framing;
    if (needed > INT32_MAX) {
        return false;
    }
    if (needed > status.capacity &&
        !status.reallocJson(&status, static_cast<std::uint32_t>(needed))) {
        return false;
    }
    if (status.json == nullptr || status.capacity < needed) {
        return false;
    }
    std::memcpy(status.json, text.data(), text.size());
    std::memset(status.json + text.size(), 0, status.capacity - text.size());
    status.json[status.capacity - 1] = 'J';
    return true;
}

}  // namespace

void fillStatus(qierr_Status& status, std::int32_t code, std::string_view text) noexcept {
    if (status.code < 0 || code == 0 || (status.code > 0 && code > 0)) {
        return;
    }
    status.code = code;
    if (!putText(status, text) && status.json != nullptr) {
        // The text of a warning that is replaced must not be taken for this failure's.
        putText(status, emptyText);
    }
}

void report(const Refusal& refusal, qierr_Status& status) noexcept {
    try {
        fillStatus(status, refusal.code(), refusal.text());
    } catch (const std::bad_alloc&) {
        fillStatus(status, refusal.code(), "{}");
    }
}

void reportCurrentException(qierr_Status& status) noexcept {
    try {
        throw;
    } catch (const Refusal& refusal) {
        report(refusal, status);
    } catch (const std::bad_alloc&) {
        fillStatus(status, code::outOfMemory.number, "{}");
    } catch (...) {
        fillStatus(status, code::driverFault.number, "{}");
    }
}

}  // namespace simulator
