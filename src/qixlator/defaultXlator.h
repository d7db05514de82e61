#pragma once

#include <qixlatormgr.h>

namespace qixlator {

// The translator of every status that names none.
constexpr const char* defaultXlatorName = "qixlator_default";

}  // namespace qixlator

// Gives the one default translator, or null when the status is negative. It searches the
// explanation files of the shared directory in the wanted language and then in English, and has no
// dynamic descriptions. qiapalerr_resourceNotFound when there is no text.
XlatorInterface* qixlator_default_create(const char* name, const char* registrationInfo,
                                         qierr_Status* status);
