#pragma once

#include <string_view>
#include <utility>
#include <variant>
#include <vector>

#include "lending/SharedTexts.h"
#include "model/Values.h"

namespace simulator {

// A value that was read. It may refer to a stored value, so it is valid while the simulator's mutex
// is held.
class ReadValue {
  public:
    // The names of a list, owned by what they name.
    using Names = std::vector<std::string_view>;

    explicit ReadValue(const Elements& stored) : value(&stored) {}
    explicit ReadValue(Elements&& computed) : value(std::move(computed)) {}
    explicit ReadValue(Names&& names) : value(std::move(names)) {}
    explicit ReadValue(const SharedTexts& names) : value(&names) {}

    // Null unless the value is such a list of names.
    const Names* names() const { return std::get_if<Names>(&value); }
    const SharedTexts* sharedNames() const {
        const auto* const* shared = std::get_if<const SharedTexts*>(&value);
        return shared != nullptr ? *shared : nullptr;
    }
    // The value unless it is a list of names.
    const Elements& elements() const {
        const auto* const* stored = std::get_if<const Elements*>(&value);
        return stored != nullptr ? **stored : std::get<Elements>(value);
    }

  private:
    std::variant<const Elements*, Elements, Names, const SharedTexts*> value;
};

}  // namespace simulator
