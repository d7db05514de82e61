/*
 * The failure record that crosses the border between the plug-in, the driver and translator
 * libraries.
 *
 * Its layout and the format of its text buffer are a binary contract between separately built
 * programs; neither may change.
 */
#ifndef QIERR_STATUS_H
#define QIERR_STATUS_H

#include <stdint.h>

#ifdef __cplusplus
extern "C" {
#endif

/*
 * One outcome: a signed code, and a JSON text with the details of a failure.
 *
 * Whoever creates the record owns it and its text, and frees the text by calling
 * reallocJson(status, 0) when json is not null. A record is used by one thread at a time.
 *
 * The buffer behind json, when there is one:
 *   - begins with a JSON object or array, ended by a NUL; "{}" when there are no details;
 *   - holds zero bytes from that NUL to the byte before the last;
 *   - holds the letter 'J' in its last byte, at index capacity - 1. Code that edits the text in
 *     place finds the end of the room by this letter.
 */
typedef struct qierr_Status {
    /* 0 success, negative error, positive warning. The first error stands: no later code
     * replaces it. */
    int32_t code;
    /* Bytes in the json buffer; 0 when there is none. */
    uint32_t capacity;
    /* Makes the buffer hold at least size bytes and keeps the text, or frees it when size is 0.
     * Returns non-zero on success; on failure the record is as it was. Never null. A library that
     * fills a record made by another grows the buffer through this function only. */
    int32_t (*reallocJson)(struct qierr_Status* status, uint32_t size);
    /* The text, or null, which means the same as "{}". */
    char* json;
} qierr_Status;

#ifdef __cplusplus
}
#endif

#endif
