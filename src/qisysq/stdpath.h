#pragma once

#include "qihtl/String.h"

// The well-known directories of the target.
//
// Each function replaces the text of `directory`, does nothing when the status is already negative,
// and may run on any thread. Paths that are built in lie below qisysq_installRoot(); a path that
// the installation or the environment gives is used as it stands.
namespace qisysq {

// The directory of the data that all programs share: what the installation wrote to share.dir, or
// the standard one when that file cannot be read. Reads the file on each call.
void getSharedDir(qihtl::String* directory, qierr_Status* status);

// The directory of application data that belongs to no user.
void getCommonAppDataDir(qihtl::String* directory, qierr_Status* status);

// The directory of temporary files: TMPDIR, an empty one included, or /tmp when that is not set.
void getTempDir(qihtl::String* directory, qierr_Status* status);

// A standard directory by its key, such as "bindir", where the relocation library puts it or at its
// default. An unknown key gives qiapalerr_osFault; a relocation that failed gives
// qiapalerr_resourceNotFound.
void getStandardDir(const char* key, qihtl::String* directory, qierr_Status* status);

}  // namespace qisysq
