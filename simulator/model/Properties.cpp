#include "model/Properties.h"

#include <algorithm>
#include <limits>
#include <type_traits>

namespace simulator {

void Enumeration::add(const std::string& item, int32_t number) {
    items.emplace_back(item, number);
    byName.emplace(item, number);
    numbers.insert(number);
}

std::optional<int32_t> Enumeration::numberOf(std::string_view item) const {
    const auto found = byName.find(item);
    return found == byName.end() ? std::nullopt : std::optional(found->second);
}

void PropertyDefinition::limit(Elements& value) const {
    std::visit(
        [&](auto& list) {
            using Items = std::decay_t<decltype(list)>;
            using Number = typename Items::value_type;
            if constexpr (!std::is_same_v<Items, List<std::string>>) {
                for (Number& item : list) {
                    item = std::max(item, least ? std::get<Items>(*least).front()
                                                : std::numeric_limits<Number>::lowest());
                    item = std::min(item, most ? std::get<Items>(*most).front()
                                               : std::numeric_limits<Number>::max());
                }
            }
        },
        value);
}

std::optional<size_t> PropertyDefinition::firstOutOfRange(const Elements& value) const {
    if (!least && !most) {
        return std::nullopt;
    }
    return std::visit(
        [&](const auto& list) -> std::optional<size_t> {
            using Items = std::decay_t<decltype(list)>;
            const auto* low = least ? &std::get<Items>(*least).front() : nullptr;
            const auto* high = most ? &std::get<Items>(*most).front() : nullptr;
            for (size_t i = 0; i < list.size(); ++i) {
                // Written so that what is not a number is outside too.
                const bool inside =
                    (low == nullptr || list[i] >= *low) && (high == nullptr || list[i] <= *high);
                if (!inside) {
                    return i;
                }
            }
            return std::nullopt;
        },
        value);
}

std::optional<size_t> PropertyDefinition::firstWithoutItem(const Elements& value) const {
    if (enumeration == nullptr) {
        return std::nullopt;
    }
    const auto& numbers = std::get<List<int32_t>>(value);
    for (size_t i = 0; i < numbers.size(); ++i) {
        if (!enumeration->has(numbers[i])) {
            return i;
        }
    }
    return std::nullopt;
}

void PropertyStore::add(const DefinitionPointer& definition, const Elements& initial) {
    all.emplace(definition->name, Property{definition, initial, initial, std::nullopt});
}

void PropertyStore::addOwn(const DefinitionPointer& definition) {
    add(definition, *definition->initial);
    own.push_back(definition->name);
}

Property* PropertyStore::find(std::string_view name) {
    const auto found = all.find(name);
    return found == all.end() ? nullptr : &found->second;
}

const Property* PropertyStore::find(std::string_view name) const {
    const auto found = all.find(name);
    return found == all.end() ? nullptr : &found->second;
}

std::vector<std::string> PropertyStore::names() const {
    std::vector<std::string> names;
    for (const auto& [name, property] : all) {
        names.push_back(name);
    }
    return names;
}

void PropertyStore::commit() {
    for (auto& [name, property] : all) {
        if (property.pending) {
            property.value = std::move(property.pending->value);
            property.pending.reset();
        }
    }
}

void PropertyStore::dropPending(nQITRMCAPI100_Session session) {
    for (auto& [name, property] : all) {
        if (property.pending && property.pending->session == session) {
            property.pending.reset();
        }
    }
}

void PropertyStore::dropAllPending() noexcept {
    for (auto& [name, property] : all) {
        property.pending.reset();
    }
}

void Catalogue::add(Category category, const DefinitionPointer& definition) {
    all[category].push_back(definition);
    byName[category].emplace(definition->name, definition);
}

const std::vector<DefinitionPointer>& Catalogue::definitions(Category category) const {
    static const std::vector<DefinitionPointer> none;
    const auto found = all.find(category);
    return found == all.end() ? none : found->second;
}

std::vector<std::string> Catalogue::names(Category category) const {
    std::vector<std::string> names;
    for (const DefinitionPointer& definition : definitions(category)) {
        names.push_back(definition->name);
    }
    return names;
}

DefinitionPointer Catalogue::find(Category category, std::string_view name) const {
    const auto names = byName.find(category);
    if (names == byName.end()) {
        return nullptr;
    }
    const auto found = names->second.find(name);
    return found == names->second.end() ? nullptr : found->second;
}

}  // namespace simulator
