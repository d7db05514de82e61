#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "qierr/Status.h"

// Inserts members into the JSON text of a status, in place.
//
// A writer is passed and returned by value. Each operation inserts at `pos` and returns a writer
// that is positioned after the insertion. If memory runs out, `pos` becomes null and every later
// operation does nothing: the status keeps its code but lacks the further details.
struct qierr_Writer {
    // The bracket at which the next member is inserted, or null.
    char* pos;
    // Enlarges the buffer. Returns the same position in the new buffer, or null.
    char* (*grow)(char* pos, qierr_Status* context);
    // The status being edited.
    qierr_Status* context;
};

// ---- The text as a whole ------------------------------------------------------------------------

// Replaces the text; null means "{}". Returns the position of its closing bracket, or null.
char* qierr_Status_setJson(qierr_Status* status, const char* text);

// Makes room for a text of `wanted` bytes. Returns the position of the text's closing bracket, or
// null on failure.
char* qierr_Status_jsonEnd(qierr_Status* status, std::uint32_t wanted);

// Doubles the size of the buffer and returns `pos` relative to the new buffer. Null on failure; the
// text is then unchanged.
char* qierr_Status_growJson(char* pos, qierr_Status* status);

// Writes file, line and, unless it is null, component at `pos`. Returns the position after the last
// member, or null.
char* qierr_Status_addPosition(qierr_Status* status, char* pos,
                               const qierr_SourcePosition& position);

// A writer at the end of the status's text, for members of the outermost object.
qierr_Writer qierr_Status_writerAtEnd(qierr_Status* status);

// ---- Members ------------------------------------------------------------------------------------

// Keys and values are NUL-terminated; the key is null for an element of an array.
qierr_Writer qierr_Writer_beginObject(qierr_Writer writer, const char* key);
qierr_Writer qierr_Writer_endObject(qierr_Writer writer);
qierr_Writer qierr_Writer_beginArray(qierr_Writer writer, const char* key);
qierr_Writer qierr_Writer_endArray(qierr_Writer writer);
qierr_Writer qierr_Writer_addString(qierr_Writer writer, const char* key, const char* value);
qierr_Writer qierr_Writer_addInt(qierr_Writer writer, const char* key, std::int32_t value);
qierr_Writer qierr_Writer_addUInt(qierr_Writer writer, const char* key, std::uint32_t value);

// ---- Details that a translator formats ----------------------------------------------------------

// A writer inside the array of details (translator_info.ordered_data) for this translator; creates
// the array if it is missing. If the status names another translator, returns a writer on which
// every operation does nothing.
qierr_Writer qierr_orderedData(const char* translatorName, qierr_Status* status);

// Adds a labelled value. `tag` is a usage tag: the key of the label in the term dictionaries.
qierr_Writer addUsageString(qierr_Writer writer, const char* tag, const char* value);
qierr_Writer addUsageUInt32(qierr_Writer writer, const char* tag, std::uint32_t value);
qierr_Writer addUsageStringArray(qierr_Writer writer, const char* tag,
                                 const std::vector<std::string>& values);

// Adds a note for maintainers, which is never sent to a client.
qierr_Writer addComment(qierr_Writer writer, const char* text);
