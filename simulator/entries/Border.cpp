#include "entries/Border.h"

namespace simulator {

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

std::string_view required(const char* text, const char* argument) {
    if (text == nullptr) {
        throw Refusal(code::missingArgument).usage(tag::argument, argument);
    }
    return text;
}

}  // namespace simulator
