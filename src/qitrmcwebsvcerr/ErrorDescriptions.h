#pragma once

#include <string>

namespace nQITRMCWEBSVC100 {

// The English sentence that tells a client of a parameter failure, by the name that the schemas and
// the procedures use for it (descriptions.tsv).
//
// Where the sentence has a "%s", that is left in place for the caller to fill. A sentence without
// one must not pass through formatting.
//
// Throws InternalError for a name, compared as bytes, that is not in the table. May be called by
// any thread once the program's static objects exist.
std::string getErrorDescription(const std::string& name);

}  // namespace nQITRMCWEBSVC100
