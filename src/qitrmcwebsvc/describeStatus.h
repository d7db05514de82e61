#pragma once

#include <qierr_status.h>

#include <string>

namespace nQITRMCWEBSVC100 {

// What a status says to a client: one line of English text, empty for a success. Throws
// qierr::Exception when the translation fails. May run on any number of threads at once.
std::string describeStatus(const qierr_Status& status);

}  // namespace nQITRMCWEBSVC100
