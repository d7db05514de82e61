/*
 * The driver, libqitrmcapi.so.1: sessions with a modular instrument chassis, reservation and
 * connection of its devices, their properties, commands, registers and non-volatile memory.
 *
 * Rules that hold for every function here:
 *
 *   - Any function may be called from any thread. Calls that wait (for a reservation, a command, a
 *     connection) do not block calls on other sessions; nQITRMCAPI100_abortSession ends the waits
 *     of its session.
 *   - The last argument of nearly every function is a status that belongs to the caller. The
 *     function sets it on failure (negative) or with a warning (positive), and enlarges its text
 *     with its reallocJson. A function whose status is already negative does nothing. Out
 *     arguments are set to 0 or null on failure.
 *   - Texts are UTF-8 and NUL-terminated. Texts that are passed in remain the caller's and are not
 *     kept.
 *   - Several resources are passed as one text: names separated by commas, with the short form
 *     "Mod1/ch0:3" for the numbered channels 0 to 3. The tokens "$ConnectedDevices",
 *     "$DefaultDevices", "$DefaultNVMEMAreas", "$DefaultPhysChans" and "$ReservedDevices" are
 *     replaced by the session's own lists.
 *   - Texts and arrays that are returned belong to the caller, who frees them with
 *     nQITRMCAPI100_freeString, nQITRMCAPI100_freeArray or nQITRMCAPI100_freeStringArray. Arrays of
 *     texts may only be read until then: several callers may have the same one.
 *   - Booleans are one byte: 0 false, anything else true.
 *   - Times are in seconds.
 */
#ifndef QITRMCAPI_H
#define QITRMCAPI_H

#include <stdint.h>

#include "qierr_status.h"

#ifdef __cplusplus
extern "C" {
#endif

/* A session. Never 0 for an open one. Calls with an invalid handle fail with a status. */
typedef uint32_t nQITRMCAPI100_Session;
/* An open property or command. Never 0 for an open one. */
typedef uint32_t nQITRMCAPI100_Property;
typedef uint32_t nQITRMCAPI100_Command;

/* ---- Freeing of returned memory ------------------------------------------------------------- */

/* Frees a text. Null is allowed. */
void nQITRMCAPI100_freeString(char* text);
/* Frees an array of numbers or Booleans. Null is allowed. Such arrays are allocated with malloc, so
 * an array that the caller allocated with malloc may be freed here too. */
void nQITRMCAPI100_freeArray(void* array);
/* Frees an array of texts with its texts. Null with count 0 is allowed. */
void nQITRMCAPI100_freeStringArray(char** array, uint32_t count);

/* ---- Enumerations --------------------------------------------------------------------------- */

/*
 * The two functions with a result and without a status. The enumerations are "ReservationAccess"
 * ("ReadOnly" 1, "ReadWrite" 3), "DataType" (1 to 14) and "PropertyAccess".
 */

/* The value of an item; 0 for an unknown enumeration or item. */
int32_t nQITRMCAPI100_translateStaticEnumStringToValue(const char* enumeration, const char* item);
/* The item of a value, or an empty text. The text is static and must not be freed. */
const char* nQITRMCAPI100_translateStaticEnumValueToString(const char* enumeration, int32_t value);

/* ---- Sessions and reservations -------------------------------------------------------------- */

/* Opens a session that holds no resources. */
void nQITRMCAPI100_initializeSessionWithoutResources(nQITRMCAPI100_Session* session,
                                                     qierr_Status* status);

/*
 * Open a session on resources of one kind, make them the session's defaults, and reserve the
 * devices that they belong to.
 *
 * timeout: its use by the closed driver is not known; callers pass 60.0.
 * access: 1 read only, 3 read and write. reservationGroup: sessions that name the same group, not
 * the empty one, share devices. reservationTimeout: how long to wait for a device that another
 * session holds; 0 means not to wait.
 * Fails with -250811 if another session still holds a device at the end of the wait.
 */
void nQITRMCAPI100_initializeSessionWithDevices(nQITRMCAPI100_Session* session, const char* devices,
                                                double timeout, int32_t access,
                                                const char* reservationGroup,
                                                double reservationTimeout, qierr_Status* status);
void nQITRMCAPI100_initializeSessionWithPhysChans(nQITRMCAPI100_Session* session,
                                                  const char* physicalChannels, double timeout,
                                                  int32_t access, const char* reservationGroup,
                                                  double reservationTimeout, qierr_Status* status);
void nQITRMCAPI100_initializeSessionWithNvmemAreas(nQITRMCAPI100_Session* session,
                                                   const char* nvmemAreas, double timeout,
                                                   int32_t access, const char* reservationGroup,
                                                   double reservationTimeout, qierr_Status* status);

/* Closes a session and releases its reservations, connections, open properties and commands. */
void nQITRMCAPI100_closeSession(nQITRMCAPI100_Session session, qierr_Status* status);

/* Aborts all calls of the session that wait; they fail. The session stays open. */
void nQITRMCAPI100_abortSession(nQITRMCAPI100_Session session, qierr_Status* status);

/* Reserves devices for an open session. Arguments and -250811 as when opening a session. */
void nQITRMCAPI100_reserveDevices(nQITRMCAPI100_Session session, const char* devices,
                                  int32_t access, const char* reservationGroup,
                                  double reservationTimeout, qierr_Status* status);

/* Releases reservations. */
void nQITRMCAPI100_unreserveDevices(nQITRMCAPI100_Session session, const char* devices,
                                    qierr_Status* status);

/* ---- Devices -------------------------------------------------------------------------------- */

/* Connects devices. With a negative timeout the driver uses its default. */
void nQITRMCAPI100_connectToDevices(nQITRMCAPI100_Session session, const char* devices,
                                    double timeout, qierr_Status* status);
void nQITRMCAPI100_disconnectFromDevices(nQITRMCAPI100_Session session, const char* devices,
                                         qierr_Status* status);
/* Resets devices to their power-on state. */
void nQITRMCAPI100_resetDevices(nQITRMCAPI100_Session session, const char* devices,
                                qierr_Status* status);
/* Renames one device, which may be a chassis. */
void nQITRMCAPI100_renameDevice(nQITRMCAPI100_Session session, const char* device,
                                const char* newName, qierr_Status* status);
/* Reads one text property of a device. A null device means the session's default device. */
void nQITRMCAPI100_getDevicePropertyString(nQITRMCAPI100_Session session, const char* device,
                                           const char* property, char** value,
                                           qierr_Status* status);

/* ---- Properties of the system --------------------------------------------------------------- */

void nQITRMCAPI100_getSystemPropertyBool(nQITRMCAPI100_Session session, const char* property,
                                         uint8_t* value, qierr_Status* status);
void nQITRMCAPI100_getSystemPropertyDouble(nQITRMCAPI100_Session session, const char* property,
                                           double* value, qierr_Status* status);
void nQITRMCAPI100_getSystemPropertyUInt64(nQITRMCAPI100_Session session, const char* property,
                                           uint64_t* value, qierr_Status* status);
void nQITRMCAPI100_getSystemPropertyStringArray(nQITRMCAPI100_Session session, const char* property,
                                                char*** array, uint32_t* count,
                                                qierr_Status* status);
void nQITRMCAPI100_setSystemPropertyBool(nQITRMCAPI100_Session session, const char* property,
                                         uint8_t value, qierr_Status* status);
void nQITRMCAPI100_setSystemPropertyDouble(nQITRMCAPI100_Session session, const char* property,
                                           double value, qierr_Status* status);

/* ---- Properties of a session ---------------------------------------------------------------- */

void nQITRMCAPI100_getSessionPropertyDouble(nQITRMCAPI100_Session session, const char* property,
                                            double* value, qierr_Status* status);
void nQITRMCAPI100_getSessionPropertyStringArray(nQITRMCAPI100_Session session,
                                                 const char* property, char*** array,
                                                 uint32_t* count, qierr_Status* status);
void nQITRMCAPI100_setSessionPropertyDouble(nQITRMCAPI100_Session session, const char* property,
                                            double value, qierr_Status* status);
void nQITRMCAPI100_setSessionPropertyStringArray(nQITRMCAPI100_Session session,
                                                 const char* property, const char* const* array,
                                                 uint32_t count, qierr_Status* status);

/* ---- Properties of devices, physical channels and NVMEM areas ------------------------------- */

/*
 * resources: one resource or several. A property of a scalar type on several resources is read
 * and written through the array functions, one element for each resource in their order.
 */

void nQITRMCAPI100_getGenericPropertyBool(nQITRMCAPI100_Session session, const char* resources,
                                          const char* property, uint8_t* value,
                                          qierr_Status* status);
void nQITRMCAPI100_getGenericPropertyDouble(nQITRMCAPI100_Session session, const char* resources,
                                            const char* property, double* value,
                                            qierr_Status* status);
void nQITRMCAPI100_getGenericPropertyInt32(nQITRMCAPI100_Session session, const char* resources,
                                           const char* property, int32_t* value,
                                           qierr_Status* status);
void nQITRMCAPI100_getGenericPropertyInt64(nQITRMCAPI100_Session session, const char* resources,
                                           const char* property, int64_t* value,
                                           qierr_Status* status);
void nQITRMCAPI100_getGenericPropertyString(nQITRMCAPI100_Session session, const char* resources,
                                            const char* property, char** value,
                                            qierr_Status* status);
void nQITRMCAPI100_getGenericPropertyUInt32(nQITRMCAPI100_Session session, const char* resources,
                                            const char* property, uint32_t* value,
                                            qierr_Status* status);
void nQITRMCAPI100_getGenericPropertyUInt64(nQITRMCAPI100_Session session, const char* resources,
                                            const char* property, uint64_t* value,
                                            qierr_Status* status);
void nQITRMCAPI100_getGenericPropertyBoolArray(nQITRMCAPI100_Session session, const char* resources,
                                               const char* property, uint8_t** array,
                                               uint32_t* count, qierr_Status* status);
void nQITRMCAPI100_getGenericPropertyDoubleArray(nQITRMCAPI100_Session session,
                                                 const char* resources, const char* property,
                                                 double** array, uint32_t* count,
                                                 qierr_Status* status);
void nQITRMCAPI100_getGenericPropertyInt32Array(nQITRMCAPI100_Session session,
                                                const char* resources, const char* property,
                                                int32_t** array, uint32_t* count,
                                                qierr_Status* status);
void nQITRMCAPI100_getGenericPropertyInt64Array(nQITRMCAPI100_Session session,
                                                const char* resources, const char* property,
                                                int64_t** array, uint32_t* count,
                                                qierr_Status* status);
void nQITRMCAPI100_getGenericPropertyStringArray(nQITRMCAPI100_Session session,
                                                 const char* resources, const char* property,
                                                 char*** array, uint32_t* count,
                                                 qierr_Status* status);
void nQITRMCAPI100_getGenericPropertyUInt32Array(nQITRMCAPI100_Session session,
                                                 const char* resources, const char* property,
                                                 uint32_t** array, uint32_t* count,
                                                 qierr_Status* status);
void nQITRMCAPI100_getGenericPropertyUInt64Array(nQITRMCAPI100_Session session,
                                                 const char* resources, const char* property,
                                                 uint64_t** array, uint32_t* count,
                                                 qierr_Status* status);
void nQITRMCAPI100_setGenericPropertyBool(nQITRMCAPI100_Session session, const char* resources,
                                          const char* property, uint8_t value,
                                          qierr_Status* status);
void nQITRMCAPI100_setGenericPropertyDouble(nQITRMCAPI100_Session session, const char* resources,
                                            const char* property, double value,
                                            qierr_Status* status);
void nQITRMCAPI100_setGenericPropertyInt32(nQITRMCAPI100_Session session, const char* resources,
                                           const char* property, int32_t value,
                                           qierr_Status* status);
void nQITRMCAPI100_setGenericPropertyInt64(nQITRMCAPI100_Session session, const char* resources,
                                           const char* property, int64_t value,
                                           qierr_Status* status);
void nQITRMCAPI100_setGenericPropertyString(nQITRMCAPI100_Session session, const char* resources,
                                            const char* property, const char* value,
                                            qierr_Status* status);
void nQITRMCAPI100_setGenericPropertyUInt32(nQITRMCAPI100_Session session, const char* resources,
                                            const char* property, uint32_t value,
                                            qierr_Status* status);
void nQITRMCAPI100_setGenericPropertyUInt64(nQITRMCAPI100_Session session, const char* resources,
                                            const char* property, uint64_t value,
                                            qierr_Status* status);
void nQITRMCAPI100_setGenericPropertyBoolArray(nQITRMCAPI100_Session session, const char* resources,
                                               const char* property, const uint8_t* array,
                                               uint32_t count, qierr_Status* status);
void nQITRMCAPI100_setGenericPropertyDoubleArray(nQITRMCAPI100_Session session,
                                                 const char* resources, const char* property,
                                                 const double* array, uint32_t count,
                                                 qierr_Status* status);
void nQITRMCAPI100_setGenericPropertyInt32Array(nQITRMCAPI100_Session session,
                                                const char* resources, const char* property,
                                                const int32_t* array, uint32_t count,
                                                qierr_Status* status);
void nQITRMCAPI100_setGenericPropertyInt64Array(nQITRMCAPI100_Session session,
                                                const char* resources, const char* property,
                                                const int64_t* array, uint32_t count,
                                                qierr_Status* status);
void nQITRMCAPI100_setGenericPropertyStringArray(nQITRMCAPI100_Session session,
                                                 const char* resources, const char* property,
                                                 const char* const* array, uint32_t count,
                                                 qierr_Status* status);
void nQITRMCAPI100_setGenericPropertyUInt32Array(nQITRMCAPI100_Session session,
                                                 const char* resources, const char* property,
                                                 const uint32_t* array, uint32_t count,
                                                 qierr_Status* status);
void nQITRMCAPI100_setGenericPropertyUInt64Array(nQITRMCAPI100_Session session,
                                                 const char* resources, const char* property,
                                                 const uint64_t* array, uint32_t count,
                                                 qierr_Status* status);

/* Makes the pending changes of these resources take effect. */
void nQITRMCAPI100_commitPropertiesGeneric(nQITRMCAPI100_Session session, const char* resources,
                                           qierr_Status* status);

/* ---- Attributes of a property --------------------------------------------------------------- */

/* Opens a property of the system or of the session, or one that the driver defines for a kind of
 * resource. */
void nQITRMCAPI100_openDriverDefinedProperty(nQITRMCAPI100_Session session, const char* property,
                                             nQITRMCAPI100_Property* handle, qierr_Status* status);
/* Opens a property that is defined by one resource itself. */
void nQITRMCAPI100_openGenericProperty(nQITRMCAPI100_Session session, const char* resource,
                                       const char* property, nQITRMCAPI100_Property* handle,
                                       qierr_Status* status);
void nQITRMCAPI100_closeProperty(nQITRMCAPI100_Property handle, qierr_Status* status);

/*
 * Read one attribute: "Prop.DataType", "Prop.Access" (Int32); "Prop.PendingChanges",
 * "Prop.IsEnum" (Bool); "Prop.Descr", "Prop.Doc", "Prop.Unit", "Prop.MinValue", "Prop.MaxValue",
 * "Prop.Enum.Name" (String); "Prop.Enum.Values" (Int32Array); "Prop.Enum.ValueNames"
 * (StringArray).
 */
void nQITRMCAPI100_getPropertyPropertyInt32(nQITRMCAPI100_Property handle, const char* attribute,
                                            int32_t* value, qierr_Status* status);
void nQITRMCAPI100_getPropertyPropertyBool(nQITRMCAPI100_Property handle, const char* attribute,
                                           uint8_t* value, qierr_Status* status);
void nQITRMCAPI100_getPropertyPropertyString(nQITRMCAPI100_Property handle, const char* attribute,
                                             char** value, qierr_Status* status);
void nQITRMCAPI100_getPropertyPropertyInt32Array(nQITRMCAPI100_Property handle,
                                                 const char* attribute, int32_t** array,
                                                 uint32_t* count, qierr_Status* status);
void nQITRMCAPI100_getPropertyPropertyStringArray(nQITRMCAPI100_Property handle,
                                                  const char* attribute, char*** array,
                                                  uint32_t* count, qierr_Status* status);

/* ---- Commands ------------------------------------------------------------------------------- */

/* Runs a command on resources. timeout: how long it may take. */
void nQITRMCAPI100_executeGenericCommand(nQITRMCAPI100_Session session, const char* resources,
                                         const char* command, double timeout, qierr_Status* status);
/* Opens a command to read its attributes. */
void nQITRMCAPI100_openGenericCommand(nQITRMCAPI100_Session session, const char* resources,
                                      const char* command, nQITRMCAPI100_Command* handle,
                                      qierr_Status* status);
void nQITRMCAPI100_closeCommand(nQITRMCAPI100_Command handle, qierr_Status* status);
/* Reads one attribute, "Cmd.Descr" or "Cmd.Doc". */
void nQITRMCAPI100_getCommandPropertyString(nQITRMCAPI100_Command handle, const char* attribute,
                                            char** value, qierr_Status* status);

/* ---- Registers ------------------------------------------------------------------------------ */

/* Read or write one register of 8, 16, 32 or 64 bits of one device. address: in bytes. */

void nQITRMCAPI100_readRegisterUInt8(nQITRMCAPI100_Session session, const char* device,
                                     uint32_t address, uint8_t* value, qierr_Status* status);
void nQITRMCAPI100_readRegisterUInt16(nQITRMCAPI100_Session session, const char* device,
                                      uint32_t address, uint16_t* value, qierr_Status* status);
void nQITRMCAPI100_readRegisterUInt32(nQITRMCAPI100_Session session, const char* device,
                                      uint32_t address, uint32_t* value, qierr_Status* status);
void nQITRMCAPI100_readRegisterUInt64(nQITRMCAPI100_Session session, const char* device,
                                      uint32_t address, uint64_t* value, qierr_Status* status);
void nQITRMCAPI100_writeRegisterUInt8(nQITRMCAPI100_Session session, const char* device,
                                      uint32_t address, uint8_t value, qierr_Status* status);
void nQITRMCAPI100_writeRegisterUInt16(nQITRMCAPI100_Session session, const char* device,
                                       uint32_t address, uint16_t value, qierr_Status* status);
void nQITRMCAPI100_writeRegisterUInt32(nQITRMCAPI100_Session session, const char* device,
                                       uint32_t address, uint32_t value, qierr_Status* status);
void nQITRMCAPI100_writeRegisterUInt64(nQITRMCAPI100_Session session, const char* device,
                                       uint32_t address, uint64_t value, qierr_Status* status);

/* ---- Non-volatile memory -------------------------------------------------------------------- */

/* Reads size bytes of an area into buffer. size 0 with a null buffer is allowed. */
void nQITRMCAPI100_getNvmemBytes(nQITRMCAPI100_Session session, const char* nvmemArea,
                                 uint32_t address, uint8_t* buffer, uint32_t size,
                                 qierr_Status* status);
/* Writes bytes to an area; a commit makes them permanent. serialNumber, password: credentials for a
 * protected area; empty otherwise. */
void nQITRMCAPI100_setNvmemBytes(nQITRMCAPI100_Session session, const char* nvmemArea,
                                 uint32_t address, const uint8_t* bytes, uint32_t size,
                                 const char* serialNumber, const char* password,
                                 qierr_Status* status);
/* Makes the pending writes of areas, or of all areas of devices, permanent. */
void nQITRMCAPI100_commitNvmemGeneric(nQITRMCAPI100_Session session, const char* resources,
                                      qierr_Status* status);

#ifdef __cplusplus
}
#endif

#endif
