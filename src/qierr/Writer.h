#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "qierr/Status.h"

// The in-place editor of a status's JSON text.
//
// A writer is a small value, passed and returned by value. Each operation inserts at `pos` and
// returns the writer advanced. Once an insertion fails, for want of memory, `pos` is null and every
// later operation does nothing: the status keeps its code and loses details.
struct qierr_Writer {
    // The bracket at which the next member goes, or null.
    char* pos;
    // Makes room: returns the same place in the new buffer, or null.
    char* (*grow)(char* pos, qierr_Status* context);
    // The status being edited.
    qierr_Status* context;
};

// ---- The text as a whole ------------------------------------------------------------------------

// Replaces the text; null means "{}". Returns the position of its closing bracket, or null.
char* qierr_Status_setJson(qierr_Status* status, const char* text);

// Makes sure of `wanted` bytes and finds the closing bracket of the whole text. Null on failure.
char* qierr_Status_jsonEnd(qierr_Status* status, std::uint32_t wanted);

// Doubles the room and rebases a writer position. Null on failure, with the text untouched.
char* qierr_Status_growJson(char* pos, qierr_Status* status);

// Writes file, line and, unless it is null, component at `pos`. Returns the position after the last
// member, or null.
char* qierr_Status_addPosition(qierr_Status* status, char* pos,
                               const qierr_SourcePosition& position);

// A writer at the end of the status's text, for members of the top level.
qierr_Writer qierr_Status_writerAtEnd(qierr_Status* status);

// ---- Members ------------------------------------------------------------------------------------

// Keys and values are NUL-terminated; a null key is for an element of an array.
qierr_Writer qierr_Writer_beginObject(qierr_Writer writer, const char* key);
qierr_Writer qierr_Writer_endObject(qierr_Writer writer);
qierr_Writer qierr_Writer_beginArray(qierr_Writer writer, const char* key);
qierr_Writer qierr_Writer_endArray(qierr_Writer writer);
qierr_Writer qierr_Writer_addString(qierr_Writer writer, const char* key, const char* value);
qierr_Writer qierr_Writer_addInt(qierr_Writer writer, const char* key, std::int32_t value);
qierr_Writer qierr_Writer_addUInt(qierr_Writer writer, const char* key, std::uint32_t value);

// ---- Details that a translator puts into words --------------------------------------------------

// A writer inside the array of details for this translator, made where it is missing. When the
// status already belongs to another translator, a writer on which every operation does nothing.
qierr_Writer qierr_orderedData(const char* translatorName, qierr_Status* status);

// A labelled datum: `tag` names the label in the term dictionaries.
qierr_Writer addUsageString(qierr_Writer writer, const char* tag, const char* value);
qierr_Writer addUsageUInt32(qierr_Writer writer, const char* tag, std::uint32_t value);
qierr_Writer addUsageStringArray(qierr_Writer writer, const char* tag,
                                 const std::vector<std::string>& values);

// A note for maintainers, which no client sees.
qierr_Writer addComment(qierr_Writer writer, const char* text);
