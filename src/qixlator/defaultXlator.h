#pragma once

#include <qixlatormgr.h>

namespace qixlator {

// The translator of every status that does not name one.
constexpr const char* defaultXlatorName = "qixlator_default";

}  // namespace qixlator

// Returns the single default translator, or null if the status is negative. It searches the
// explanation files of the shared directory in the requested language and then in English, and has
// no dynamic descriptions. It reports qiapalerr_resourceNotFound if there is no text.
XlatorInterface* qixlator_default_create(const char* name, const char* registrationInfo,
                                         qierr_Status* status);
