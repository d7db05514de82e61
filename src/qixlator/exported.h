#pragma once

#include <qixlatormgr.h>

// Makes a translator that this program lends, for a manager library: see qixlatormgr.h.
// qiapalerr_invalidParameter when the name is not one of exportedRegistrations(). Exported under
// its plain name.
extern "C" __attribute__((visibility("default"))) XlatorInterface* qixlator_exported_create(
    const char* name, const char* registrationInfo, qierr_Status* status);
