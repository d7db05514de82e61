#include "model/Properties.h"

#include <algorithm>

namespace simulator {

bool Enumeration::has(int32_t value) const {
    return std::any_of(items.begin(), items.end(),
                       [&](const auto& item) { return item.second == value; });
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
    for (const DefinitionPointer& definition : definitions(category)) {
        if (definition->name == name) {
            return definition;
        }
    }
    return nullptr;
}

}  // namespace simulator
