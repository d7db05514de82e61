#include "status/Refusal.h"

#include <utility>

namespace simulator {

Refusal::Refusal(std::int32_t code, std::optional<std::string> name) : reason{code, nullptr} {
    if (name) {
        constant = std::make_shared<const std::string>(std::move(*name));
        reason.constant = constant->c_str();
    }
}

Refusal& Refusal::usageEnum(std::string_view tag, std::int32_t value, std::uint32_t id) {
    details.addUsageEnum(tag, value, id);
    return *this;
}

Refusal& Refusal::elaboration(std::string_view term) {
    details.addElaboration(term);
    return *this;
}

Refusal& Refusal::header(std::string_view term) {
    details.addHeader(term);
    return *this;
}

Refusal& Refusal::empty() {
    details.addEmpty();
    return *this;
}

Refusal& Refusal::cause(const Refusal& other) {
    details.addCause(other.reason.number, other.reason.constant, other.details);
    return *this;
}

Refusal& Refusal::ownText(std::string text) {
    whole = std::move(text);
    return *this;
}

}  // namespace simulator
