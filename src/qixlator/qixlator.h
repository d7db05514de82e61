#pragma once

#include <qixlatormgr.h>

#include <cstdint>

// Puts statuses into words: the way in.
//
//     qixlator::Session* session = qixlator_createSession(&failure);
//     qihtl::String text;
//     qixlator::json1::translateErrStatusToRawText(session, &status, attributes, flags, &text,
//                                                  &failure);
//     qixlator_destroySession(session);
//
// with the layout functions of json1.h. Nothing throws. Sessions of different threads are
// independent.

namespace qixlator {

// A translation in progress: keeps the translators it has made. Belongs to one thread.
class Session;

}  // namespace qixlator

// Bits 0 to 7 of an attribute word: the language. Bits 8 to 11: the environment that asks.
constexpr std::uint32_t qixlator_languageMask = 0xFF;
constexpr std::uint32_t qixlator_adeShift = 8;
constexpr std::uint32_t qixlator_adeMask = 0xF;

// A new session for the caller to destroy, or null: with qiapalerr_memoryFull when memory runs out,
// and when the status is already negative.
qixlator::Session* qixlator_createSession(qierr_Status* status);

// Ends the session with its translators. The session may be null.
void qixlator_destroySession(qixlator::Session* session);

// The description of a code by the named translator, made with `alloc`; the caller frees it through
// the same function. Null with a negative status when it fails (qiapalerr_resourceNotFound: the
// translator describes no codes), and null when the translator has no text.
char* qixlator_getStaticDesc(qixlator::Session* session, std::int32_t code, const char* xlatorName,
                             std::uint32_t attributes, qixlator_Alloc alloc, void* allocContext,
                             qierr_Status* status);

// The description of a status's JSON text, in the named format, by the translator that the text
// names. As above; qiapalerr_resourceNotFound also when the text names no translator.
char* qixlator_getDynamicDesc(qixlator::Session* session, const char* json,
                              std::uint32_t attributes, const char* format, qixlator_Alloc alloc,
                              void* allocContext, qierr_Status* status);

// The qixlator_Alloc of this program. `status` may be null.
void* qixlator_realloc(void* pointer, std::uint32_t size, void* allocContext, qierr_Status* status);
