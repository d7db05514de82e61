#include "qitrmcwebsvc/exponentGuard.h"

#include <cstddef>
#include <cstring>

#include "common/digits.h"

namespace nQITRMCWEBSVC100 {
namespace {

using common::isDigit;

// An exponent with more digits than this, not counting leading zeros, is reduced.
constexpr std::size_t safeDigits = 9;
constexpr std::size_t countableDigits = 200'000'000;

// The positions of the digits of an exponent such as "e-0123", without leading zeros.
struct ExponentDigits {
    std::size_t begin = 0;
    std::size_t end = 0;

    bool tooMany() const { return end - begin > safeDigits; }
};

ExponentDigits negativeExponentAt(const char* text) {
    if ((text[0] != 'e' && text[0] != 'E') || text[1] != '-') {
        return {};
    }
    ExponentDigits digits{2, 2};
    while (text[digits.begin] == '0') {
        ++digits.begin;
    }
    digits.end = digits.begin;
    while (isDigit(text[digits.end])) {
        ++digits.end;
    }
    return digits;
}

// A fast check: every exponent in question has a minus sign, which is rare in requests.
bool mayHoldLongExponent(const char* text) {
    for (const char* minus = text; (minus = std::strchr(minus, '-')) != nullptr; ++minus) {
        if (minus != text && negativeExponentAt(minus - 1).tooMany()) {
            return true;
        }
    }
    return false;
}

// The position after the string whose opening quote is at `position`.
std::size_t behindString(const std::string& text, std::size_t position) {
    for (++position; position < text.size() && text[position] != '"'; ++position) {
        if (text[position] == '\\') {
            ++position;
        }
    }
    return position + 1;
}

}  // namespace

std::optional<std::string> withSafeExponents(const char* text) {
    if (!mayHoldLongExponent(text)) {
        return std::nullopt;
    }
    std::string safe(text);
    for (std::size_t position = 0; position < safe.size();) {
        if (safe[position] == '"') {
            position = behindString(safe, position);
            continue;
        }
        const ExponentDigits digits = negativeExponentAt(safe.c_str() + position);
        if (digits.tooMany()) {
            safe.replace(position + digits.begin, digits.end - digits.begin - safeDigits,
                         digits.end - digits.begin - safeDigits, '0');
            safe.replace(position + digits.end - safeDigits, safeDigits, safeDigits, '9');
        }
        position += digits.end != 0 ? digits.end : 1;
    }
    return safe;
}

bool holdsUncountableNumber(const std::string& text) {
    if (text.size() <= countableDigits) {
        return false;
    }
    std::size_t digits = 0;
    for (std::size_t position = 0; position < text.size() && digits <= countableDigits;) {
        digits = isDigit(text[position]) ? digits + 1 : 0;
        position = text[position] == '"' ? behindString(text, position) : position + 1;
    }
    return digits > countableDigits;
}

}  // namespace nQITRMCWEBSVC100
