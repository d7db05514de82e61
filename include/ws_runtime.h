/*
 * The web runtime, libws_runtime.so.13: what the embedded web server offers to a service plug-in,
 * and what it expects of one.
 *
 * All functions may be called from any thread that is inside a plug-in's run function, with the
 * request handle which that run function was given, and with no other. No function frees or keeps
 * a pointer that it is given.
 */
#ifndef WS_RUNTIME_H
#define WS_RUNTIME_H

#include <stdint.h>

#ifdef __cplusplus
extern "C" {
#endif

/* One HTTP request in flight. Opaque; valid for the length of one run call. */
typedef struct ws_Request ws_Request;

/* Text of 32-bit characters from begin up to, not including, end. Both null means empty. */
typedef struct ws_WideString {
    const uint32_t* begin;
    const uint32_t* end;
} ws_WideString;

typedef struct ws_Entry ws_Entry;

/* The operations of an entry, a table of four functions. Only the fourth is for plug-ins. */
typedef struct ws_EntryOperations {
    void (*reserved0)(ws_Entry* entry);
    void (*reserved1)(ws_Entry* entry);
    void (*reserved2)(ws_Entry* entry);
    /* The name under which the request came in. The text belongs to the server and is valid for
     * the length of the run call. */
    ws_WideString (*entryName)(const ws_Entry* entry);
} ws_EntryOperations;

/* The entry of a web service through which a request came. Owned by the server. */
struct ws_Entry {
    const ws_EntryOperations* operations;
};

/*
 * Reads one variable of the request as NUL-terminated text: "REQUEST_TRANSPORT" ("http" or
 * "https") or "REQUEST_METHOD" ("GET", "POST" and so on).
 *
 * size: in, the bytes in buffer; out, the bytes that the call needs when they do not fit.
 * Returns 0 on success. Non-zero with *size not 0: call again with a buffer of *size bytes.
 * Non-zero with *size 0: there is no such variable.
 */
int ReadRequestVariable_C_REST_QI_QVWS_(ws_Request* request, const char* name, char* buffer,
                                        uint32_t* size);

/*
 * Reads the request's body. Arguments and result are those of the variable call; a body that
 * fits is followed by a NUL only where there is room for one, and *size is then left alone.
 */
int ReadPostData_C_REST_QI_QVWS_(ws_Request* request, char* buffer, uint32_t* size);

/* Sets the HTTP status of the response. Without this call the status is 200. */
void SetHTTPResponseCode_QI_QVWS_(ws_Request* request, int code);

/* Sets the content type of the response, a NUL-terminated text that is copied. */
void SetHTTPResponseMimeType_C_REST_QI_QVWS_(ws_Request* request, const char* type);

/* Appends length bytes to the body of the response. The bytes are copied. */
void WriteOutput_C_REST_QI_QVWS_(ws_Request* request, const char* data, uint32_t length);

/*
 * What a plug-in exports, each under the name given here with the plug-in's prefix in front, for
 * example "qitrmcRun". The server calls Init once before the first request and Finalize once after
 * the last, never while a request is in flight; Run from any number of threads at once.
 */
typedef void (*ws_PluginInit)(void);
typedef void (*ws_PluginPause)(void);
typedef void (*ws_PluginResume)(void);
typedef void (*ws_PluginFinalize)(void);
typedef void (*ws_PluginRun)(ws_Entry* entry, ws_Request* request);

#ifdef __cplusplus
}
#endif

#endif
