#pragma once

#include <qierr_status.h>

#include <string>

namespace nQITRMCWEBSVC100 {

// The text of a status for a client: one line of English in valid UTF-8, empty for a success.
// Throws qierr::Exception if the translation fails. During stack unwinding such a failure is
// ignored, and the text that was produced so far is returned. Each call opens a translation
// session. Any number of threads may call it.
//
// It is a library of its own, so that tests of the service can link another implementation.
std::string describeStatus(const qierr_Status& status);

}  // namespace nQITRMCWEBSVC100
