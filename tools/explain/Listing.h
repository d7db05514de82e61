#pragma once

#include <string>
#include <vector>

#include "explain/Catalogue.h"
#include "explain/Translator.h"

namespace explain {

// All entries in the explanation files, one line each with code, name and first sentence. Throws
// Failure if there are none.
std::string listAll(Translator& translator);

// The entries whose name or text contains the word, ignoring letter case. Throws Failure if there
// are none.
std::string listMatches(const std::string& word, Translator& translator);

// Similar entries, each as a line end followed by a line as above.
std::string suggestions(const std::vector<Entry>& entries, Translator& translator);

}  // namespace explain
