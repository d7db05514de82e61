#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "Codes.h"
#include "status/Details.h"

namespace simulator {

// Thrown to fail one call of the driver with a status. The adding functions return the refusal
// itself, so that it is made and thrown in one expression.
class Refusal {
  public:
    explicit Refusal(const Code& code) : reason(code) {}

    template <typename Value>
    Refusal& usage(std::string_view tag, const Value& value) {
        details.addUsage(tag, value);
        return *this;
    }
    Refusal& usageEnum(std::string_view tag, int32_t value, uint32_t id);
    Refusal& elaboration(std::string_view term);
    Refusal& header(std::string_view term);
    Refusal& empty();
    Refusal& cause(const Refusal& other);

    int32_t code() const { return reason.number; }
    std::string text() const { return details.text(reason.constant); }

  private:
    Code reason;
    Details details;
};

}  // namespace simulator
