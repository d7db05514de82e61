/*
 * The status record that the plug-in, the driver and translator libraries exchange.
 *
 * Its layout and the format of its text buffer are a binary interface between separately built
 * programs; neither may change.
 */
#ifndef QIERR_STATUS_H
#define QIERR_STATUS_H

#include <stdint.h>

#ifdef __cplusplus
extern "C" {
#endif

/*
 * The result of an operation: a signed code, and a JSON text with the details of a failure.
 *
 * The creator of the record owns it and its text, and frees the text by calling
 * reallocJson(status, 0) if json is not null. A record is used by one thread at a time.
 *
 * The buffer that json points to, if there is one:
 *   - begins with a JSON object or array, terminated by a NUL; "{}" if there are no details;
 *   - contains zero bytes from that NUL to the byte before the last;
 *   - contains the letter 'J' in its last byte, at index capacity - 1. Code that edits the text in
 *     place finds the end of the buffer by this letter.
 */
typedef struct qierr_Status {
    /* 0 success, negative error, positive warning. The first error is kept: no later code
     * replaces it. */
    int32_t code;
    /* Size of the json buffer in bytes; 0 if there is none. */
    uint32_t capacity;
    /* Enlarges the buffer to at least size bytes and keeps the text, or frees it if size is 0.
     * Returns non-zero on success; on failure the record is unchanged. Never null. A library that
     * fills a record of another library must use this function to enlarge the buffer. */
    int32_t (*reallocJson)(struct qierr_Status* status, uint32_t size);
    /* The text, or null, which means the same as "{}". */
    char* json;
} qierr_Status;

#ifdef __cplusplus
}
#endif

#endif
