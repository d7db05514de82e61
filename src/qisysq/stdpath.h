// Folder qisysq: directories and files of the target system, and dynamic loading of libraries.
#pragma once

#include "qihtl/String.h"

// The standard directories of the target.
//
// Each function replaces the text of `directory`. It does nothing if the status is already
// negative, and may be called from any thread. Built-in paths are prefixed with
// qisysq_installRoot(); a path from a configuration file or the environment is used unchanged.
namespace qisysq {

// The shared data directory: the content of the installed file share.dir, or the default if that
// file cannot be read. A change of the file shows at the next call.
void getSharedDir(qihtl::String* directory, qierr_Status* status);

// The directory of application data that is common to all users.
void getCommonAppDataDir(qihtl::String* directory, qierr_Status* status);

// The directory of temporary files: the value of TMPDIR, even if it is empty, or /tmp if TMPDIR is
// not set.
void getTempDir(qihtl::String* directory, qierr_Status* status);

// The standard directory with this key, such as "bindir": as given by the relocation library, or
// the default. qiapalerr_osFault for an unknown key; qiapalerr_resourceNotFound if the relocation
// failed.
void getStandardDir(const char* key, qihtl::String* directory, qierr_Status* status);

}  // namespace qisysq
