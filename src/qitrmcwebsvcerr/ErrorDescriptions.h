// Folder qitrmcwebsvcerr: the sentences that describe invalid parameters.
#pragma once

#include <string>

namespace nQITRMCWEBSVC100 {

// The English sentence that describes an invalid parameter, by the name under which the schemas and
// procedures refer to it (descriptions.tsv).
//
// A "%s" in the sentence is to be replaced by the caller. A sentence without "%s" must not be used
// as a format.
//
// Throws InternalError for a name that is not in the table; names are compared as bytes. May be
// called from any thread after static initialisation.
std::string getErrorDescription(const std::string& name);

}  // namespace nQITRMCWEBSVC100
