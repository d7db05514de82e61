/*
 * The optional relocation library, libqirelocations.so.0. With it a packaged system changes the
 * standard installation directories.
 */
#ifndef QIRELOCATIONS_H
#define QIRELOCATIONS_H

#include <stdint.h>

#ifdef __cplusplus
extern "C" {
#endif

/*
 * Looked up by the name "get_relocated_dir".
 *
 * key: the name of a standard directory, such as "bindir". buffer: receives the relocated
 * directory as NUL-terminated text; it has bufferSize bytes, of which at most 255 are used.
 * Returns a positive count if a directory was written, 0 to keep the default, a negative number on
 * failure. May be called from any thread.
 */
typedef int32_t (*get_relocated_dir_fn)(const char* key, char* buffer, uint32_t bufferSize);

#ifdef __cplusplus
}
#endif

#endif
