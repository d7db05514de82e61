/*
 * The web runtime, libws_runtime.so.13: the functions that the embedded web server provides for a
 * service plug-in, and those that a plug-in must export.
 *
 * The functions may be called only by a thread that executes the plug-in's run function, and only
 * with the request handle that was passed to that run function. No function frees or keeps a
 * pointer that is passed to it.
 */
#ifndef WS_RUNTIME_H
#define WS_RUNTIME_H

#include <stdint.h>

#ifdef __cplusplus
extern "C" {
#endif

/* One HTTP request that is being processed. Opaque; valid during one run call. */
typedef struct ws_Request ws_Request;

/* Text of 32-bit characters from begin up to, but not including, end. Both null means empty. */
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
    /* The name of the entry in the request. The text belongs to the server and is valid during the
     * run call. */
    ws_WideString (*entryName)(const ws_Entry* entry);
} ws_EntryOperations;

/* The entry of a web service to which a request was sent. Owned by the server. */
struct ws_Entry {
    const ws_EntryOperations* operations;
};

/*
 * Reads one variable of the request as NUL-terminated text: "REQUEST_TRANSPORT" ("http" or
 * "https") or "REQUEST_METHOD" ("GET", "POST" and so on).
 *
 * size: in, the size of buffer in bytes; out, the required size if the buffer is too small.
 * Returns 0 on success. Non-zero with *size not 0: call again with a buffer of *size bytes.
 * Non-zero with *size 0: there is no such variable.
 */
int ReadRequestVariable_C_REST_QI_QVWS_(ws_Request* request, const char* name, char* buffer,
                                        uint32_t* size);

/*
 * Reads the request's body. Arguments and result as for ReadRequestVariable_C_REST_QI_QVWS_. A body
 * that fits is followed by a NUL only if the buffer has room for it; *size is then not changed.
 */
int ReadPostData_C_REST_QI_QVWS_(ws_Request* request, char* buffer, uint32_t* size);

/* Sets the HTTP status of the response. Without this call the status is 200. */
void SetHTTPResponseCode_QI_QVWS_(ws_Request* request, int code);

/* Sets the content type of the response, a NUL-terminated text that is copied. */
void SetHTTPResponseMimeType_C_REST_QI_QVWS_(ws_Request* request, const char* type);

/* Appends length bytes to the body of the response. The bytes are copied. */
void WriteOutput_C_REST_QI_QVWS_(ws_Request* request, const char* data, uint32_t length);

/*
 * The functions that a plug-in exports. Each name is the plug-in's prefix and the last word of the
 * type's name, for example "qitrmcRun". The server calls Init once before the first request and
 * Finalize once after the last, never while a request is being processed. It calls Run from any
 * number of threads concurrently.
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
