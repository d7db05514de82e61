/*
 * Translators: objects that put a status into words, and the optional manager library
 * libqixlator.so.1, which knows the translators of other programs.
 */
#ifndef QIXLATORMGR_H
#define QIXLATORMGR_H

#include <stdint.h>

#include "qierr_status.h"

#ifdef __cplusplus
extern "C" {
#endif

/*
 * Allocates for a translator, with the meaning of realloc: a null pointer allocates, size 0 frees
 * and returns null. Does nothing and returns null when status is already negative, unless size is
 * 0; sets a negative status when memory runs out.
 */
typedef void* (*qixlator_Alloc)(void* pointer, uint32_t size, void* allocContext,
                                qierr_Status* status);

/*
 * One translator. An implementation may keep fields of its own behind these. Used by one thread at
 * a time.
 *
 * attributes: bits 0 to 7 hold the language (0 English, 1 French, 2 German, 3 Japanese, 4 Korean,
 * 5 simplified Chinese), bits 8 to 11 the development environment that asks (0 none, 1 to 3).
 * The texts that come back are UTF-8, NUL-terminated, made with alloc, and belong to the caller,
 * who frees them through the same function. Null with a status that is not negative means that
 * there is no text.
 */
typedef struct XlatorInterface {
    /* Always 16, on every platform. */
    uint32_t structSize;
    /* Ends the translator and frees it. */
    void (*destroy)(struct XlatorInterface* self);
    /* The description of a code. May be null. */
    char* (*getStaticDesc)(struct XlatorInterface* self, int32_t code, uint32_t attributes,
                           qixlator_Alloc alloc, void* allocContext, qierr_Status* status);
    /* The description of a status's JSON text, in the named format ("json1"). May be null. */
    char* (*getDynamicDesc)(struct XlatorInterface* self, const char* json, uint32_t attributes,
                            const char* format, qixlator_Alloc alloc, void* allocContext,
                            qierr_Status* status);
} XlatorInterface;

/* A session with the manager, which keeps the translators made in it. Opaque. */
typedef struct qixlatormgr_Session qixlatormgr_Session;

/*
 * The entry points of the manager, looked up by these names. The status says what failed; after a
 * negative status the result is null.
 */
typedef qixlatormgr_Session* (*qixlatormgr_createSession_fn)(qierr_Status* status);
typedef void (*qixlatormgr_destroySession_fn)(qixlatormgr_Session* session);
typedef XlatorInterface* (*qixlatormgr_createXlator_fn)(qixlatormgr_Session* session,
                                                        const char* name, qierr_Status* status);
typedef void (*qixlatormgr_destroyXlator_fn)(qixlatormgr_Session* session, XlatorInterface* xlator);

/*
 * Exported by a program that lends its translators, for the manager to call: makes the translator
 * of this name, set up by a registration text (a JSON object that the caller brings). The
 * translator is ended by its own destroy. Null with a negative status when the name is unknown or
 * the set-up fails.
 */
typedef XlatorInterface* (*qixlator_exported_create_fn)(const char* name,
                                                        const char* registrationInfo,
                                                        qierr_Status* status);

#ifdef __cplusplus
}
#endif

#endif
