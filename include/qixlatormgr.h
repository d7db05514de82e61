/*
 * Translators: objects that format a status as text, and the optional manager library
 * libqixlator.so.1, which provides the translators of other programs.
 */
#ifndef QIXLATORMGR_H
#define QIXLATORMGR_H

#include <stdint.h>

#include "qierr_status.h"

#ifdef __cplusplus
extern "C" {
#endif

/*
 * Allocates memory for a translator, like realloc: a null pointer allocates, size 0 frees and
 * returns null. Does nothing and returns null if status is already negative, unless size is 0. Sets
 * a negative status if memory runs out.
 */
typedef void* (*qixlator_Alloc)(void* pointer, uint32_t size, void* allocContext,
                                qierr_Status* status);

/*
 * One translator. An implementation may have fields of its own after these. Used by one thread at a
 * time.
 *
 * attributes: bits 0 to 7 are the language (0 English, 1 French, 2 German, 3 Japanese, 4 Korean,
 * 5 simplified Chinese), bits 8 to 11 the ADE, the application development environment of the
 * caller (0 none, 1 to 3).
 * Returned texts are UTF-8, NUL-terminated and allocated with alloc. They belong to the caller, who
 * frees them with the same function. Null with a status that is not negative means that there is no
 * text.
 */
typedef struct XlatorInterface {
    /* Always 16, on every platform. */
    uint32_t structSize;
    /* Destroys and frees the translator. */
    void (*destroy)(struct XlatorInterface* self);
    /* The description of a code. May be null. */
    char* (*getStaticDesc)(struct XlatorInterface* self, int32_t code, uint32_t attributes,
                           qixlator_Alloc alloc, void* allocContext, qierr_Status* status);
    /* The description of a status's JSON text, in the named format ("json1"). May be null. */
    char* (*getDynamicDesc)(struct XlatorInterface* self, const char* json, uint32_t attributes,
                            const char* format, qixlator_Alloc alloc, void* allocContext,
                            qierr_Status* status);
} XlatorInterface;

/* A session of the manager, which owns the translators that are created in it. Opaque. */
typedef struct qixlatormgr_Session qixlatormgr_Session;

/*
 * The functions of the manager, looked up by these names. A failure is reported in the status, and
 * the result is then null.
 */
typedef qixlatormgr_Session* (*qixlatormgr_createSession_fn)(qierr_Status* status);
typedef void (*qixlatormgr_destroySession_fn)(qixlatormgr_Session* session);
typedef XlatorInterface* (*qixlatormgr_createXlator_fn)(qixlatormgr_Session* session,
                                                        const char* name, qierr_Status* status);
typedef void (*qixlatormgr_destroyXlator_fn)(qixlatormgr_Session* session, XlatorInterface* xlator);

/*
 * Exported by a program that offers its translators to others; called by the manager. Creates the
 * translator of this name, configured with the registration text, a JSON object. The translator is
 * freed by its function destroy. Returns null with a negative status if the name is unknown or the
 * configuration fails.
 */
typedef XlatorInterface* (*qixlator_exported_create_fn)(const char* name,
                                                        const char* registrationInfo,
                                                        qierr_Status* status);

#ifdef __cplusplus
}
#endif

#endif
