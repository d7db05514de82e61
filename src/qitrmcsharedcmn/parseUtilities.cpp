#include "qitrmcsharedcmn/parseUtilities.h"

#include <rapidjson/encodings.h>
#include <rapidjson/memorystream.h>

#include <algorithm>
#include <charconv>

#include "common/digits.h"
#include "qitrmcsharedcmn/Exceptions.h"

namespace nQITRMCSHAREDCMN100 {

namespace {

using common::isDigit;

constexpr std::uint32_t largestRange = 1024;

[[noreturn]] void refuse(const std::string& name, const qierr_SourcePosition& position) {
    BasicError error(qierr::codes::invalidResourceName, position);
    addUsageString(error.details(), "kUsageTypeRequestedValue", checkUtf8(name).c_str());
    throw error;
}

bool hasSlash(const std::string& name) {
    return name.find('/') != std::string::npos;
}

bool isAllDigits(const std::string& text, std::size_t from) {
    return std::all_of(text.begin() + static_cast<std::ptrdiff_t>(from), text.end(), isDigit);
}

// The position of the first of the digits directly before `end`.
std::size_t startOfDigits(const std::string& name, std::size_t end) {
    while (end > 0 && isDigit(name[end - 1])) {
        --end;
    }
    return end;
}

// The number in the digits from `begin` up to `end`.
std::uint32_t numberIn(const std::string& name, std::size_t begin, std::size_t end) {
    std::uint32_t number = 0;
    const auto result = std::from_chars(name.data() + begin, name.data() + end, number);
    if (result.ec != std::errc()) {
        refuse(name, QITRMC_HERE);
    }
    return number;
}

ParsedName parseRange(const std::string& name, NameKind kind, std::size_t colon) {
    const std::size_t digits = startOfDigits(name, colon);
    if (digits == 0 && kind != NameKind::Plain) {
        refuse(name, QITRMC_HERE);
    }
    if (digits == colon || !isAllDigits(name, colon + 1)) {
        refuse(name, QITRMC_HERE);
    }
    const std::uint32_t start = numberIn(name, digits, colon);
    const std::uint32_t end = numberIn(name, colon + 1, name.size());
    if (start > end || end - start >= largestRange) {
        refuse(name, QITRMC_HERE);
    }
    return {name.substr(0, digits), start, end, true};
}

ParsedName parseSingle(const std::string& name) {
    const std::size_t digits = startOfDigits(name, name.size());
    if (digits == name.size()) {
        return {name, 0, 0, false};
    }
    const std::uint32_t number = numberIn(name, digits, name.size());
    return {name.substr(0, digits), number, number, true};
}

// Calls `use` with each part between commas, including empty parts.
template <typename Use>
void forEachPart(const std::string& names, Use use) {
    std::size_t begin = 0;
    for (;;) {
        const std::size_t comma = names.find(',', begin);
        use(names.substr(begin, comma - begin));
        if (comma == std::string::npos) {
            return;
        }
        begin = comma + 1;
    }
}

// Whether `next` begins with the number that follows the range in `last`, with the same prefix.
bool continues(const ParsedName& last, const ParsedName& next) {
    return next.hasNumber && last.hasNumber && next.start != 0 && last.end == next.start - 1 &&
           last.prefix == next.prefix;
}

void append(std::string& text, const ParsedName& entry) {
    text += entry.prefix;
    if (!entry.hasNumber) {
        return;
    }
    text += std::to_string(entry.start);
    if (entry.start != entry.end) {
        text += ':';
        text += std::to_string(entry.end);
    }
}

}  // namespace

ParsedName parseName(const std::string& name, NameKind kind) {
    const bool isPath = hasSlash(name);
    if (kind == NameKind::Plain && isPath) {
        refuse(name, QITRMC_HERE);
    }
    if (kind != NameKind::Plain && !isPath) {
        return {name, 0, 0, false};
    }
    const std::size_t colon = name.find(':');
    return colon != std::string::npos ? parseRange(name, kind, colon) : parseSingle(name);
}

void appendExpanded(std::vector<std::string>& list, const std::string& names, NameKind kind) {
    forEachPart(names, [&](std::string part) {
        const ParsedName parsed = parseName(part, kind);
        if (!parsed.hasNumber) {
            list.push_back(std::move(part));
            return;
        }
        const std::size_t count = parsed.end - parsed.start + std::size_t{1};
        if (count > 1 && list.size() + count > maxNamesWithRanges) {
            refuse(part, QITRMC_HERE);
        }
        for (std::uint32_t i = 0; i < count; ++i) {
            list.push_back(parsed.prefix + std::to_string(parsed.start + i));
        }
    });
}

std::vector<std::string> expandNames(const std::string& names, NameKind kind) {
    std::vector<std::string> list;
    appendExpanded(list, names, kind);
    return list;
}

std::string compressNames(const std::vector<std::string>& names, NameKind kind) {
    std::string text;
    ParsedName last{};
    for (std::size_t i = 0; i < names.size(); ++i) {
        ParsedName parsed = parseName(names[i], kind);
        if (i != 0 && continues(last, parsed)) {
            ++last.end;
            continue;
        }
        if (i != 0) {
            append(text, last);
            text += ',';
        }
        last = std::move(parsed);
    }
    if (!names.empty()) {
        append(text, last);
    }
    return text;
}

const std::string& checkUtf8(const std::string& name) {
    rapidjson::MemoryStream bytes(name.data(), name.size());
    while (bytes.Tell() < name.size()) {
        unsigned codePoint;
        if (!rapidjson::UTF8<>::Decode(bytes, &codePoint)) {
            throw BasicError(qierr::codes::invalidUtf8, QITRMC_HERE);
        }
    }
    return name;
}

}  // namespace nQITRMCSHAREDCMN100
