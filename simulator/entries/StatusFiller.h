#pragma once

#include <cstdint>
#include <string_view>

#include "qierr_status.h"
#include "status/Refusal.h"

namespace simulator {

// Sets the code of a status that is not negative yet, unless it is a warning that would replace a
// warning, and puts the details into its text. The memory for the text comes from the record's own
// reallocJson; if that fails the code is set and the details are lost.
void fillStatus(qierr_Status& status, std::int32_t code, std::string_view text) noexcept;

// Puts a refusal into a status. Without the memory for its details, only the code arrives.
void report(const Refusal& refusal, qierr_Status& status) noexcept;
// Puts the exception in flight into a status.
void reportCurrentException(qierr_Status& status) noexcept;

}  // namespace simulator
