#pragma once

#include <cstdint>
#include <string>

namespace explain {

// The words of all languages, as an enumeration in English.
std::string languageWords();

// The number of a language given by its word, such as "deu". Throws UsageError for any other word.
std::uint32_t languageOfWord(const std::string& word);

// The number of the language that LC_ALL, LC_MESSAGES or LANG sets, the first that is not empty;
// English when none is set or the language has no texts.
std::uint32_t languageOfEnvironment();

}  // namespace explain
