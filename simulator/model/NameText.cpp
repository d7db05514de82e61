#include "model/NameText.h"

#include <utf8proc.h>

#include <algorithm>
#include <charconv>
#include <cstdlib>
#include <memory>
#include <new>

#include "common/digits.h"
#include "common/utf8.h"
#include "status/Refusal.h"

namespace simulator {

using common::isDigit;

namespace {

constexpr std::uint32_t longestRange = 1024;
constexpr std::size_t longestName = 64;

bool isAscii(std::string_view text) {
    return std::all_of(text.begin(), text.end(), [](unsigned char c) { return c < 0x80; });
}

char foldAscii(char c) {
    return c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
}

std::uint32_t rangeNumber(std::string_view digits, std::string_view name) {
    std::uint32_t number = 0;
    const auto [end, error] = std::from_chars(digits.data(), digits.data() + digits.size(), number);
    if (error != std::errc() || end != digits.data() + digits.size()) {
        throw Refusal(code::invalidNameRange).usage(tag::requestedValue, name);
    }
    return number;
}

using Visit = std::function<void(const std::string&)>;

void visitNames(std::string_view part, const Visit& visit) {
    const std::size_t colon = part.find(':');
    if (colon == std::string_view::npos || part.find('/') == std::string_view::npos) {
        visit(std::string(part));
        return;
    }
    std::size_t digits = colon;
    while (digits > 0 && isDigit(part[digits - 1])) {
        --digits;
    }
    const std::uint32_t first = rangeNumber(part.substr(digits, colon - digits), part);
    const std::uint32_t last = rangeNumber(part.substr(colon + 1), part);
    if (first > last || last - first >= longestRange) {
        throw Refusal(code::invalidNameRange).usage(tag::requestedValue, part);
    }
    const std::string prefix(part.substr(0, digits));
    for (std::uint32_t offset = 0; offset <= last - first; ++offset) {
        visit(prefix + std::to_string(first + offset));
    }
}

// The number at the end of a name may be written as part of a range, where leading zeros are lost.
bool endsInZeroPaddedNumber(std::string_view name) {
    const auto lastOther = std::find_if_not(name.rbegin(), name.rend(), isDigit);
    const std::size_t digits = static_cast<std::size_t>(lastOther - name.rbegin());
    return digits > 1 && name[name.size() - digits] == '0';
}

bool isValidUtf8(std::string_view text) {
    while (!text.empty()) {
        const common::Utf8Character character = common::takeCharacter(text);
        if (!character.isValid()) {
            return false;
        }
    }
    return true;
}

}  // namespace

std::string foldName(std::string_view name) {
    if (isAscii(name)) {
        std::string folded(name);
        std::transform(folded.begin(), folded.end(), folded.begin(), foldAscii);
        return folded;
    }
    utf8proc_uint8_t* folded = nullptr;
    const auto length =
        utf8proc_map(reinterpret_cast<const utf8proc_uint8_t*>(name.data()),
                     static_cast<utf8proc_ssize_t>(name.size()), &folded, UTF8PROC_CASEFOLD);
    const std::unique_ptr<utf8proc_uint8_t, decltype(&std::free)> owner(folded, &std::free);
    if (length == UTF8PROC_ERROR_NOMEM) {
        throw std::bad_alloc();
    }
    if (length < 0) {
        return std::string(name);
    }
    return std::string(reinterpret_cast<const char*>(folded), static_cast<std::size_t>(length));
}

FoldedName::FoldedName(std::string_view name) {
    if (name.size() <= shortText.size() && isAscii(name)) {
        std::transform(name.begin(), name.end(), shortText.begin(), foldAscii);
        folded = std::string_view(shortText.data(), name.size());
    } else {
        otherText = foldName(name);
        folded = otherText;
    }
}

void forEachName(std::string_view joined, const Visit& visit) {
    constexpr std::size_t none = std::string_view::npos;
    std::size_t comma = joined.empty() ? none : 0;
    while (comma != none) {
        comma = joined.find(',');
        visitNames(joined.substr(0, comma), visit);
        joined.remove_prefix(comma == none ? joined.size() : comma + 1);
    }
}

std::string nameError(std::string_view name) {
    const auto isControl = [](unsigned char c) { return c < 0x20 || c == 0x7F; };
    if (name.empty()) {
        return "a name must not be empty";
    }
    if (name.size() > longestName) {
        return "a name has at most 64 bytes";
    }
    if (!isValidUtf8(name)) {
        return "a name must be UTF-8 text";
    }
    if (name.find_first_of(",/:") != std::string_view::npos) {
        return "a name must not hold a comma, a slash or a colon";
    }
    if (name.front() == '$') {
        return "names that begin with a dollar sign are reserved";
    }
    if (name.front() == ' ' || name.back() == ' ' ||
        std::any_of(name.begin(), name.end(), isControl)) {
        return "a name must not begin or end with a blank nor hold control characters";
    }
    return {};
}

std::string partNameError(std::string_view name) {
    if (endsInZeroPaddedNumber(name)) {
        return "the number at its end must not begin with 0, or a range could not name it";
    }
    return nameError(name);
}

}  // namespace simulator
