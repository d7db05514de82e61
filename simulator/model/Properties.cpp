#include "model/Properties.h"

#include <algorithm>
#include <limits>
#include <type_traits>

namespace simulator {

void Enumeration::add(const std::string& item, std::int32_t number) {
    items.emplace_back(item, number);
    byName.emplace(item, number);
    numbers.insert(number);
}

std::optional<std::int32_t> Enumeration::numberOf(std::string_view item) const {
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

std::optional<std::size_t> PropertyDefinition::firstOutOfRange(const Elements& value) const {
    if (!least && !most) {
        return std::nullopt;
    }
    return std::visit(
        [&](const auto& list) -> std::optional<std::size_t> {
            using Items = std::decay_t<decltype(list)>;
            const auto* low = least ? &std::get<Items>(*least).front() : nullptr;
            const auto* high = most ? &std::get<Items>(*most).front() : nullptr;
            for (std::size_t i = 0; i < list.size(); ++i) {
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

std::optional<std::size_t> PropertyDefinition::firstWithoutItem(const Elements& value) const {
    if (enumeration == nullptr) {
        return std::nullopt;
    }
    const auto& numbers = std::get<List<std::int32_t>>(value);
    for (std::size_t i = 0; i < numbers.size(); ++i) {
        if (!enumeration->has(numbers[i])) {
            return i;
        }
    }
    return std::nullopt;
}

PropertyStore::PropertyStore(const PropertyStore& other) : all(other.all), own(other.own) {
    byName.reserve(all.size());
    for (auto& [name, property] : all) {
        byName.emplace(HashedName(name), &property);
    }
}

PropertyStore& PropertyStore::operator=(PropertyStore other) noexcept {
    all.swap(other.all);
    byName.swap(other.byName);
    own.swap(other.own);
    return *this;
}

void PropertyStore::add(const DefinitionPointer& definition, const Elements& initial) {
    const auto added =
        all.emplace(definition->name, Property{definition, initial, initial, std::nullopt}).first;
    byName.emplace(HashedName(added->first), &added->second);
}

void PropertyStore::addOwn(const DefinitionPointer& definition) {
    add(definition, *definition->initial);
    std::get<List<std::string>>(own).push_back(definition->name);
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
    Part& part = parts[static_cast<std::size_t>(category)];
    part.definitions.push_back(definition);
    part.names.discard();
    part.byName.emplace(HashedName(definition->name), definition);
}

const SharedTexts& Catalogue::names(Category category) const {
    return part(category).names.get([&] {
        std::vector<std::string_view> names;
        for (const DefinitionPointer& definition : definitions(category)) {
            names.push_back(definition->name);
        }
        return names;
    });
}

const DefinitionPointer& Catalogue::find(Category category, const HashedName& name) const {
    static const DefinitionPointer none;
    const NameIndex<DefinitionPointer>& byName = part(category).byName;
    const auto found = byName.find(name);
    return found == byName.end() ? none : found->second;
}

}  // namespace simulator
