#include "sessions/PropertyAccessor.h"

#include "description/Nearest.h"
#include "sessions/ComputedProperties.h"
#include "status/Refusal.h"

namespace simulator {

namespace {

Category categoryOf(Kind kind) {
    switch (kind) {
        case Kind::physChan:
            return Category::physChan;
        case Kind::nvmemArea:
            return Category::nvmemArea;
        default:
            return Category::device;
    }
}

// known: the names that can be read or written instead.
[[noreturn]] void refuseUnknown(std::string_view name, const Resource* resource,
                                const std::vector<std::string>& known) {
    Refusal refusal(code::unknownProperty);
    refusal.usage(tag::propertyName, name);
    if (resource != nullptr) {
        refusal.usage(tag::resource, resource->fullName());
    }
    if (const std::string* nearest = nearestName(name, known)) {
        refusal.usage(tag::nearestName, *nearest);
    }
    throw refusal;
}

// resource: null for the system and the session.
Refusal about(const Code& reason, const PropertyDefinition& definition,
              const Resource* resource = nullptr) {
    Refusal refusal(reason);
    refusal.usage(tag::propertyName, definition.name);
    if (resource != nullptr) {
        refusal.usage(tag::resource, resource->fullName());
    }
    return refusal;
}

void expectType(const PropertyDefinition& definition, DataType type, size_t places) {
    if (places > 1 && (isArray(definition.type) || !isArray(type))) {
        throw about(code::severalResources, definition);
    }
    const DataType expected = places > 1 ? arrayType(definition.type) : definition.type;
    if (type != expected) {
        throw about(code::wrongPropertyType, definition)
            .usage(tag::dataType, typeName(definition.type));
    }
}

// "Off (0)" and the like.
std::vector<std::string> itemsOf(const Enumeration& enumeration) {
    std::vector<std::string> items;
    for (const auto& [name, number] : enumeration.items) {
        items.push_back(name + " (" + std::to_string(number) + ")");
    }
    return items;
}

[[noreturn]] void refuseRange(const PropertyDefinition& definition, const Resource* resource,
                              const Elements& value, size_t index) {
    Refusal refusal = about(code::valueOutOfRange, definition, resource);
    refusal.usage(tag::requestedValue, firstText(elementAt(value, index)));
    if (definition.least) {
        refusal.usage(tag::minimum, firstText(*definition.least));
    }
    if (definition.most) {
        refusal.usage(tag::maximum, firstText(*definition.most));
    }
    throw refusal;
}

// Calls visit(Resource&) for resources, and for all parts of the devices among them.
template <typename Visit>
void forEachPart(const std::vector<Resource*>& resources, Visit visit) {
    for (Resource* resource : resources) {
        if (resource->kind == Kind::device) {
            resource->device->forEachResource(visit);
        } else {
            visit(*resource);
        }
    }
}

}  // namespace

std::vector<std::string> PropertyAccessor::knownNames(Category category, const Resource* resource,
                                                      const PropertyStore& store) const {
    std::vector<std::string> names = store.names();
    for (const DefinitionPointer& definition : simulator.chassis->catalogue.definitions(category)) {
        if (definition->computed &&
            computedValue(simulator, session, category, resource, definition->name)) {
            names.push_back(definition->name);
        }
    }
    return names;
}

PropertyAccessor::Place PropertyAccessor::find(Category category, Resource* resource,
                                               PropertyStore& store, std::string_view name) {
    if (Property* stored = store.find(name)) {
        return {category, resource, stored->definition, stored, std::nullopt};
    }
    auto computed = computedValue(simulator, session, category, resource, name);
    DefinitionPointer definition = simulator.chassis->catalogue.find(category, name);
    if (!computed || definition == nullptr) {
        refuseUnknown(name, resource, knownNames(category, resource, store));
    }
    return {category, resource, definition, nullptr, std::move(computed)};
}

std::vector<PropertyAccessor::Place> PropertyAccessor::findIn(Category category,
                                                              std::string_view name) {
    PropertyStore& store =
        category == Category::session ? session.properties : simulator.chassis->systemProperties;
    return {find(category, nullptr, store, name)};
}

std::vector<PropertyAccessor::Place> PropertyAccessor::find(std::string_view resources,
                                                            std::string_view name) {
    if (simulator.chassis->catalogue.find(Category::session, name) != nullptr) {
        return findIn(Category::session, name);
    }
    const auto found = simulator.resolver(session).anyResources(resources);
    expectSome(found);
    std::vector<Place> places;
    for (Resource* resource : found) {
        places.push_back(find(categoryOf(resource->kind), resource, resource->properties, name));
        // Lists of several resources are refused. They must not pile up until that is found out.
        if (found.size() > 1 && isArray(places.back().definition->type)) {
            places.back().computed.reset();
        }
    }
    return places;
}

Elements PropertyAccessor::readAll(const std::vector<Place>& places, DataType type) {
    Elements all = noElements(type);
    const int64_t now = simulator.clock.now();
    for (const Place& place : places) {
        expectType(*place.definition, type, places.size());
        if (place.definition->access == PropertyAccess::writeOnly) {
            throw about(code::writeOnlyProperty, *place.definition);
        }
        append(all,
               place.computed ? *place.computed : simulator.motions.valueAt(*place.stored, now));
    }
    return all;
}

Elements PropertyAccessor::readSystem(std::string_view name, DataType type) {
    return readAll(findIn(Category::system, name), type);
}

Elements PropertyAccessor::readSession(std::string_view name, DataType type) {
    return readAll(findIn(Category::session, name), type);
}

Elements PropertyAccessor::read(std::string_view resources, std::string_view name, DataType type) {
    return readAll(find(resources, name), type);
}

void PropertyAccessor::expectAcceptable(const Place& place, const Elements& value) const {
    const PropertyDefinition& definition = *place.definition;
    if (definition.access == PropertyAccess::readOnly) {
        throw about(code::readOnlyProperty, definition, place.resource);
    }
    if (const auto index = definition.firstWithoutItem(value)) {
        throw about(code::valueNotEnumerated, definition, place.resource)
            .usageEnum(tag::requestedValue, std::get<List<int32_t>>(value)[*index],
                       definition.enumeration->id)
            .usage(tag::allowedValues, itemsOf(*definition.enumeration));
    }
    if (const auto index = definition.firstOutOfRange(value)) {
        refuseRange(definition, place.resource, value, *index);
    }
    if (place.resource != nullptr) {
        simulator.reservations.expectWritable(session.handle, *place.resource->device);
    }
}

void PropertyAccessor::writeAll(const std::vector<Place>& places, DataType type,
                                const Elements& values) {
    std::vector<Elements> parts;
    for (size_t i = 0; i < places.size(); ++i) {
        expectType(*places[i].definition, type, places.size());
        if (places.size() > 1 && elementCount(values) != places.size()) {
            throw about(code::wrongElementCount, *places[i].definition)
                .usage(tag::valueCount, static_cast<uint32_t>(elementCount(values)));
        }
        parts.push_back(places.size() > 1 ? elementAt(values, i) : values);
        expectAcceptable(places[i], parts.back());
    }
    Change change = simulator.lasting.change();
    for (size_t i = 0; i < places.size(); ++i) {
        if (places[i].stored != nullptr && !places[i].definition->needsCommit) {
            change.property(places[i].resource, *places[i].definition, parts[i]);
        }
    }
    simulator.lasting.keep(change);
    for (size_t i = 0; i < places.size(); ++i) {
        if (places[i].stored == nullptr) {
            setDefaultResources(simulator.resolver(session), session, places[i].definition->name,
                                std::get<List<std::string>>(parts[i]));
        } else if (places[i].definition->needsCommit) {
            places[i].stored->pending = Property::Pending{std::move(parts[i]), session.handle};
        } else {
            places[i].stored->value = std::move(parts[i]);
            noteChange(places[i].resource);
        }
    }
}

void PropertyAccessor::noteChange(const Resource* resource) noexcept {
    if (resource != nullptr) {
        simulator.motions.noteChange(*resource, simulator.clock.now());
    }
}

void PropertyAccessor::writeSystem(std::string_view name, DataType type, const Elements& values) {
    writeAll(findIn(Category::system, name), type, values);
}

void PropertyAccessor::writeSession(std::string_view name, DataType type, const Elements& values) {
    writeAll(findIn(Category::session, name), type, values);
}

void PropertyAccessor::write(std::string_view resources, std::string_view name, DataType type,
                             const Elements& values) {
    writeAll(find(resources, name), type, values);
}

void PropertyAccessor::commit(std::string_view resources) {
    const auto found = simulator.resolver(session).anyResources(resources);
    expectSome(found);
    for (const Resource* resource : found) {
        simulator.reservations.expectWritable(session.handle, *resource->device);
    }
    Change change = simulator.lasting.change();
    forEachPart(found, [&](Resource& part) {
        part.properties.forEach([&](const Property& property) {
            if (property.pending) {
                change.property(&part, *property.definition, property.pending->value);
            }
        });
    });
    simulator.lasting.keep(change);
    forEachPart(found, [&](Resource& part) {
        part.properties.commit();
        noteChange(&part);
    });
}

OpenProperty PropertyAccessor::openDriverDefined(std::string_view name) {
    constexpr Category categories[] = {Category::session, Category::system, Category::device,
                                       Category::physChan, Category::nvmemArea};
    for (const Category category : categories) {
        if (auto definition = simulator.chassis->catalogue.find(category, name)) {
            return {session.handle, category, std::move(definition), nullptr};
        }
    }
    std::vector<std::string> known;
    for (const Category category : categories) {
        for (const DefinitionPointer& other : simulator.chassis->catalogue.definitions(category)) {
            known.push_back(other->name);
        }
    }
    refuseUnknown(name, nullptr, known);
}

OpenProperty PropertyAccessor::openGeneric(std::string_view resource, std::string_view name) {
    const auto found = simulator.resolver(session).anyResources(resource);
    expectOne(found);
    Resource& owner = *found.front();
    Place place = find(categoryOf(owner.kind), &owner, owner.properties, name);
    return {session.handle, place.category, std::move(place.definition), &owner};
}

}  // namespace simulator
