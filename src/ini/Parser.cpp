#include "ini/Parser.h"

#include <algorithm>

#include "ini/nameComparison.h"

namespace ini {

namespace {

// The number in a key that ends in " Line<digits>", without leading zeros. Empty for any other key.
std::string_view splitNumber(std::string_view key) {
    static constexpr std::string_view word = " Line";
    const std::size_t lastOther = key.find_last_not_of("0123456789");
    if (lastOther == key.npos || lastOther + 1 == key.size()) {
        return {};
    }
    const std::string_view head = key.substr(0, lastOther + 1);
    if (head.size() < word.size() || head.substr(head.size() - word.size()) != word) {
        return {};
    }
    std::string_view digits = key.substr(lastOther + 1);
    digits.remove_prefix(std::min(digits.find_first_not_of('0'), digits.size() - 1));
    return digits;
}

std::vector<IniEntry> joined(std::vector<IniEntry>& entries) {
    std::vector<IniEntry> result;
    result.reserve(entries.size());
    bool inRun = false;
    for (IniEntry& entry : entries) {
        const std::string_view number = splitNumber(entry.key);
        if (inRun && !number.empty() && number != "1") {
            result.back().value += entry.value;
            continue;
        }
        inRun = number == "1";
        if (inRun) {
            entry.key.resize(entry.key.rfind(" Line"));
        }
        result.push_back(std::move(entry));
    }
    return result;
}

}  // namespace

void Parser::addLine(std::string_view line) {
    ++lineNumber;
    line = withoutLeadingBlanks(line);
    if (line.empty() || line.front() == ';') {
        return;
    }
    const bool good = line.front() == '[' ? parseSection(line) : parseKey(line);
    if (!good && file.firstBadLine < 0) {
        file.firstBadLine = lineNumber;
    }
}

bool Parser::parseSection(std::string_view line) {
    const std::size_t end = line.find(']');
    if (end == line.npos) {
        return false;
    }
    const std::string_view name = withoutTrailingBlanks(line.substr(1, end - 1));
    if (name.empty()) {
        return false;
    }
    openSection(name);
    return true;
}

void Parser::openSection(std::string_view name) {
    const std::size_t next = file.sections.size();
    const auto [known, isNew] = sectionIndex.emplace(folded(name, file.ignoreCase), next);
    if (file.mergeRepeated && !isNew) {
        current = known->second;
        return;
    }
    file.sections.push_back({std::string(name), {}, lineNumber});
    current = next;
}

bool Parser::parseKey(std::string_view line) {
    KeyLine parts;
    if (!split(line, parts) || parts.key.empty()) {
        return false;
    }
    if (parts.value.empty() && !accepts(ini_acceptEmptyValues)) {
        return false;
    }
    if (current == none && accepts(ini_acceptColons)) {
        openSection("(null)");
    }
    if (current != none) {
        store(parts);
    }
    return true;
}

bool Parser::split(std::string_view line, KeyLine& parts) const {
    const std::size_t separator = line.find_first_of(accepts(ini_acceptColons) ? ":=" : "=");
    if (separator == line.npos) {
        return false;
    }
    const std::size_t width = line.substr(separator, 2) == ":=" ? 2 : 1;
    parts.key = withoutTrailingBlanks(line.substr(0, separator));
    parts.value = withoutTrailingBlanks(withoutLeadingBlanks(line.substr(separator + width)));
    return true;
}

char Parser::quoteAround(std::string_view value) const {
    if (value.size() < 2 || value.front() != value.back()) {
        return 0;
    }
    const bool stripped = (value.front() == '"' && accepts(ini_stripDoubleQuotes)) ||
                          (value.front() == '\'' && accepts(ini_stripSingleQuotes));
    return stripped ? value.front() : '\0';
}

void Parser::store(const KeyLine& parts) {
    std::string_view value = parts.value;
    const char quote = quoteAround(value);
    if (quote != 0) {
        value = value.substr(1, value.size() - 2);
    }
    std::vector<IniEntry>& entries = file.sections[current].entries;
    const std::string name = std::to_string(current) + '=' + folded(parts.key, file.ignoreCase);
    const auto [known, isNew] = entryIndex.emplace(name, entries.size());
    if (file.mergeRepeated && !isNew) {
        IniEntry& entry = entries[known->second];
        entry.value = value;
        entry.line = lineNumber;
        entry.quote = quote;
        return;
    }
    entries.push_back({std::string(parts.key), std::string(value), lineNumber, quote});
}

void Parser::joinSplitValues() {
    for (IniSection& section : file.sections) {
        section.entries = joined(section.entries);
    }
}

}  // namespace ini
