#pragma once

#include <qixlatormgr.h>

// Creates a translator of this program for a manager library; see qixlator_exported_create_fn in
// qixlatormgr.h. qiapalerr_invalidParameter if exportedRegistrations() has no such name.
extern "C" __attribute__((visibility("default"))) XlatorInterface* qixlator_exported_create(
    const char* name, const char* registrationInfo, qierr_Status* status);
