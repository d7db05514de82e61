// Folder qixlator: formats statuses as text, by translators and explanation files.
#pragma once

#include <qixlatormgr.h>

#include <cstdint>

// The entry functions of the translation. Typical use:
//
//     qixlator::Session* session = qixlator_createSession(&failure);
//     qihtl::String text;
//     qixlator::json1::translateErrStatusToRawText(session, &status, attributes, flags, &text,
//                                                  &failure);
//     qixlator_destroySession(session);
//
// with the functions of json1.h. No function throws. Sessions of different threads are independent.

namespace qixlator {

// A translation session: owns the translators that are created in it. Used by one thread.
class Session;

}  // namespace qixlator

// Bits 0 to 7 of an attribute word: the language. Bits 8 to 11: the ADE, the application
// development environment of the caller.
constexpr std::uint32_t qixlator_languageMask = 0xFF;
constexpr std::uint32_t qixlator_adeShift = 8;
constexpr std::uint32_t qixlator_adeMask = 0xF;

// Creates a session, to be destroyed by the caller. Returns null if the status is already negative,
// and with qiapalerr_memoryFull if memory runs out.
qixlator::Session* qixlator_createSession(qierr_Status* status);

// Destroys the session and its translators. The session may be null.
void qixlator_destroySession(qixlator::Session* session);

// The description of a code by the named translator, allocated with `alloc` and to be freed with it
// by the caller. Null with a negative status on failure (qiapalerr_resourceNotFound if the
// translator does not describe codes), and null if the translator has no text for the code.
char* qixlator_getStaticDesc(qixlator::Session* session, std::int32_t code, const char* xlatorName,
                             std::uint32_t attributes, qixlator_Alloc alloc, void* allocContext,
                             qierr_Status* status);

// The description of a status's JSON text, in the named format, by the translator that the text
// names. Result as above; qiapalerr_resourceNotFound also if the text names no translator.
char* qixlator_getDynamicDesc(qixlator::Session* session, const char* json,
                              std::uint32_t attributes, const char* format, qixlator_Alloc alloc,
                              void* allocContext, qierr_Status* status);

// The qixlator_Alloc of this program. `status` may be null.
void* qixlator_realloc(void* pointer, std::uint32_t size, void* allocContext, qierr_Status* status);
