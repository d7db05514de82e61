#include "explain/Listing.h"

#include <utf8proc.h>

#include <algorithm>
#include <cstdlib>
#include <memory>
#include <string_view>

#include "explain/Failure.h"

namespace explain {
namespace {

struct Free {
    void operator()(utf8proc_uint8_t* text) const { std::free(text); }
};

// The text in case-folded form; unchanged if it is not valid UTF-8.
std::string folded(const std::string& text) {
    utf8proc_uint8_t* result = nullptr;
    const auto options =
        static_cast<utf8proc_option_t>(UTF8PROC_STABLE | UTF8PROC_COMPOSE | UTF8PROC_CASEFOLD);
    const auto length = utf8proc_map(reinterpret_cast<const utf8proc_uint8_t*>(text.data()),
                                     static_cast<utf8proc_ssize_t>(text.size()), &result, options);
    const std::unique_ptr<utf8proc_uint8_t, Free> owner(result);
    if (length < 0) {
        return text;
    }
    return {reinterpret_cast<const char*>(result), static_cast<std::size_t>(length)};
}

// Up to a full stop that is followed by a blank, or to an ideographic full stop.
std::string firstSentence(const std::string& text) {
    constexpr std::string_view ideographicStop = "。";
    const std::string line = text.substr(0, text.find('\n'));
    const std::size_t stop = line.find(". ");
    const std::size_t wideStop = line.find(ideographicStop);
    if (wideStop < stop) {
        return line.substr(0, wideStop + ideographicStop.size());
    }
    return stop == std::string::npos ? line : line.substr(0, stop + 1);
}

std::string listed(const Entry& entry, const std::string& text) {
    constexpr std::size_t widestCode = 7;
    const std::string code = std::to_string(entry.code);
    const std::string indent(widestCode - std::min(widestCode, code.size()), ' ');
    std::string line = indent + code + "  " + std::string(entry.name);
    if (!text.empty()) {
        line += ": " + firstSentence(text);
    }
    return line;
}

// Entries without a text are left out: they cannot be explained here.
std::string listContaining(const std::string& foldedWord, Translator& translator) {
    std::string lines;
    for (const Entry& entry : catalogue()) {
        const std::string text = translator.explanation(entry.code);
        const std::string searched = folded(std::string(entry.name) + "\n" + text);
        if (!text.empty() && searched.find(foldedWord) != std::string::npos) {
            lines += listed(entry, text) + "\n";
        }
    }
    return lines;
}

}  // namespace

std::string listAll(Translator& translator) {
    const std::string lines = listContaining({}, translator);
    if (lines.empty()) {
        throw Failure("The explanation files are missing. Look whether they are installed.");
    }
    return lines;
}

std::string listMatches(const std::string& word, Translator& translator) {
    const std::string lines = listContaining(folded(word), translator);
    if (!lines.empty()) {
        return lines;
    }
    listAll(translator);
    throw Failure("No name and no text contains \"" + word + "\".");
}

std::string suggestions(const std::vector<Entry>& entries, Translator& translator) {
    std::string lines;
    for (const Entry& entry : entries) {
        lines += "\n" + listed(entry, translator.explanation(entry.code));
    }
    return lines;
}

}  // namespace explain
