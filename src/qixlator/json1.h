#pragma once

#include <cstdint>

#include "qierr/Status.h"
#include "qihtl/String.h"
#include "qixlator/qixlator.h"

// Lays a status out as one text, its nested errors included.
namespace qixlator::json1 {

// Bits of the flag word: what the text of the status shows. A nested error always shows its
// description, its dynamic items and its own nested errors, and its debug items if they are asked
// for.
constexpr std::uint32_t includeStatic = 1;
constexpr std::uint32_t includeDynamic = 2;
constexpr std::uint32_t includeDebug = 4;
constexpr std::uint32_t includeNested = 8;

// Appends the text of `source` to `output` and then trims line ends off both ends of `output`. A
// source with code 0 has no text. Attributes as in qixlatormgr.h. A failure leaves a negative
// `status` and the text as far as it came; nothing is done when `status` is already negative.
//
// The description is followed by a line "Label: value" for each item; nested errors follow,
// indented by three blanks a level.
void translateErrStatusToRawText(Session* session, const qierr_Status* source,
                                 std::uint32_t attributes, std::uint32_t flags,
                                 qihtl::String* output, qierr_Status* status);

// The same with labels and elaborations in "<B>" and "</B>".
void translateErrStatusToFormattedText(Session* session, const qierr_Status* source,
                                       std::uint32_t attributes, std::uint32_t flags,
                                       qihtl::String* output, qierr_Status* status);

}  // namespace qixlator::json1
