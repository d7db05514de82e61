#pragma once

#include <string>
#include <vector>

#include "explain/Catalogue.h"
#include "explain/Translator.h"

namespace explain {

// All entries that the explanation files have, a line each with code, name and first sentence.
// Throws Failure when there is none.
std::string listAll(Translator& translator);

// The entries whose name or text contains the word. Letter case does not count. Throws Failure when
// there is none.
std::string listMatches(const std::string& word, Translator& translator);

// The entries that may have been meant, each a line as above behind a line end.
std::string suggestions(const std::vector<Entry>& entries, Translator& translator);

}  // namespace explain
