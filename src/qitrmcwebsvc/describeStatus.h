#pragma once

#include <qierr_status.h>

#include <string>

namespace nQITRMCWEBSVC100 {

// What a status says to a client: one line of English text, always valid UTF-8, and empty for a
// success. Throws qierr::Exception when the translation fails; while an exception is in flight that
// failure is dropped, and the text is what there is of it. Costs a translation session each time.
// May run on any number of threads at once.
//
// A library of its own, so that tests of the service can link other words.
std::string describeStatus(const qierr_Status& status);

}  // namespace nQITRMCWEBSVC100
