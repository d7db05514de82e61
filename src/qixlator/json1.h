#pragma once

#include <cstdint>

#include "qierr/Status.h"
#include "qihtl/String.h"
#include "qixlator/qixlator.h"

// Formats a status, including its nested errors, as one text. The format "json1" is the JSON form
// in which a translator returns the details of a status.
namespace qixlator::json1 {

// Bits of the flag word: the parts that the text of the status contains. The text of a nested error
// always contains its description, its dynamic items and its own nested errors, and contains its
// debug items if includeDebug is set.
constexpr std::uint32_t includeStatic = 1;
constexpr std::uint32_t includeDynamic = 2;
constexpr std::uint32_t includeDebug = 4;
constexpr std::uint32_t includeNested = 8;

// Appends the text of `source` to `output` and then removes line ends from both ends of `output`. A
// source with code 0 has no text. Attributes as in qixlatormgr.h. A failure sets a negative
// `status`; `output` then holds the text produced up to that point. Does nothing if `status` is
// already negative.
//
// The description is followed by a line "Label: value" for each item, then by the nested errors,
// indented by three blanks for each level.
void translateErrStatusToRawText(Session* session, const qierr_Status* source,
                                 std::uint32_t attributes, std::uint32_t flags,
                                 qihtl::String* output, qierr_Status* status);

// The same with labels and elaborations enclosed in "<B>" and "</B>".
void translateErrStatusToFormattedText(Session* session, const qierr_Status* source,
                                       std::uint32_t attributes, std::uint32_t flags,
                                       qihtl::String* output, qierr_Status* status);

}  // namespace qixlator::json1
