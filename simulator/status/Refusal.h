#pragma once

#include <memory>
#include <optional>
#include <string>
#include <string_view>

#include "Codes.h"
#include "status/Details.h"

namespace simulator {

// Thrown to fail one call of the driver with a status. The adding functions return the refusal
// itself, so that it is made and thrown in one expression.
class Refusal {
  public:
    explicit Refusal(const Code& code) : reason(code) {}
    // A status that the driver itself does not know. `name` is what its details carry as
    // its constant; they can do without.
    Refusal(std::int32_t code, std::optional<std::string> name);

    template <typename Value>
    Refusal& usage(std::string_view tag, const Value& value) {
        details.addUsage(tag, value);
        return *this;
    }
    Refusal& usageEnum(std::string_view tag, std::int32_t value, std::uint32_t id);
    Refusal& elaboration(std::string_view term);
    Refusal& header(std::string_view term);
    Refusal& empty();
    // The other one must not have a text of its own.
    Refusal& cause(const Refusal& other);
    // Replaces the details by this text, unchanged. It need not be JSON.
    Refusal& ownText(std::string text);

    std::int32_t code() const { return reason.number; }
    std::string text() const { return whole ? *whole : details.text(reason.constant); }

  private:
    Code reason;
    Details details;
    // What the constant of a status points to that is not the driver's own.
    std::shared_ptr<const std::string> constant;
    std::optional<std::string> whole;
};

}  // namespace simulator
