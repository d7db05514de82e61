#include "explain/Language.h"

#include <cstdlib>
#include <iterator>

#include "explain/Failure.h"

namespace explain {
namespace {

struct Language {
    const char* word;
    const char* locale;
};

// In the order of the translator's numbers.
constexpr Language languages[] = {
#include "LanguageRows.inc"
};
constexpr std::uint32_t english = 0;

// A locale is written as in "de_DE.UTF-8@euro".
std::uint32_t languageOfLocale(const std::string& locale) {
    const std::string code = locale.substr(0, locale.find_first_of("_.@"));
    std::uint32_t number = 0;
    for (const Language& language : languages) {
        if (code == language.locale) {
            return number;
        }
        ++number;
    }
    return english;
}

}  // namespace

std::string languageWords() {
    const std::size_t last = std::size(languages) - 1;
    std::string words = languages[0].word;
    for (std::size_t i = 1; i <= last; ++i) {
        words += (i == last ? " or " : ", ") + std::string(languages[i].word);
    }
    return words;
}

std::uint32_t languageOfWord(const std::string& word) {
    std::uint32_t number = 0;
    for (const Language& language : languages) {
        if (word == language.word) {
            return number;
        }
        ++number;
    }
    throw UsageError("There is no language \"" + word + "\". Use " + languageWords() +
                     " with --language.");
}

std::uint32_t languageOfEnvironment() {
    for (const char* name : {"LC_ALL", "LC_MESSAGES", "LANG"}) {
        const char* const locale = std::getenv(name);
        if (locale != nullptr && *locale != '\0') {
            return languageOfLocale(locale);
        }
    }
    return english;
}

}  // namespace explain
