#include "sessions/PropertyAccessor.h"

#include "description/Nearest.h"
#include "sessions/ComputedProperties.h"
#include "status/Refusal.h"

namespace simulator {

namespace {

Category categoryOf(Kind kind) {
    switch (kind) {
        case Kind::PhysChan:
            return Category::PhysChan;
        case Kind::NvmemArea:
            return Category::NvmemArea;
        default:
            return Category::Device;
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

void expectType(const PropertyDefinition& definition, DataType type, std::size_t places) {
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
                              const Elements& value, std::size_t index) {
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
        if (resource->kind == Kind::Device) {
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
            computedValue(simulator, session, category, resource, HashedName(definition->name))) {
            names.push_back(definition->name);
        }
    }
    return names;
}

PropertyAccessor::Place PropertyAccessor::find(Category category, Resource* resource,
                                               PropertyStore& store, const HashedName& name) {
    if (Property* stored = store.find(name)) {
        return {resource, stored->definition.get(), stored, std::nullopt};
    }
    const DefinitionPointer& definition = simulator.chassis->catalogue.find(category, name);
    auto computed = definition != nullptr
                        ? computedValue(simulator, session, category, resource, name)
                        : std::nullopt;
    if (!computed) {
        refuseUnknown(name.text, resource, knownNames(category, resource, store));
    }
    return {resource, definition.get(), nullptr, std::move(computed)};
}

PropertyAccessor::Place PropertyAccessor::findIn(Category category, const HashedName& name) {
    PropertyStore& store =
        category == Category::Session ? session.properties : simulator.chassis->systemProperties;
    return find(category, nullptr, store, name);
}

PropertyAccessor::Place PropertyAccessor::findOn(Resource& resource, const HashedName& name) {
    return find(categoryOf(resource.kind), &resource, resource.properties, name);
}

bool PropertyAccessor::isOfSession(const HashedName& name) const {
    return simulator.chassis->catalogue.find(Category::Session, name) != nullptr;
}

std::vector<PropertyAccessor::Place> PropertyAccessor::findAll(std::string_view resources,
                                                               const HashedName& name) {
    std::vector<Place> places;
    if (isOfSession(name)) {
        places.push_back(findIn(Category::Session, name));
        return places;
    }
    const auto found = simulator.resolver(session).anyResources(resources);
    expectSome(found);
    for (Resource* resource : found) {
        places.push_back(findOn(*resource, name));
        // Lists of several resources are refused. They must not pile up until that is found out.
        if (found.size() > 1 && isArray(places.back().definition->type)) {
            places.back().computed.reset();
        }
    }
    return places;
}

ReadValue PropertyAccessor::readOne(Place place, DataType type, std::size_t places) {
    expectType(*place.definition, type, places);
    if (place.definition->access == PropertyAccess::WriteOnly) {
        throw about(code::writeOnlyProperty, *place.definition);
    }
    if (place.stored == nullptr) {
        return std::move(*place.computed);
    }
    if (simulator.motions.find(*place.stored) == nullptr) {
        return ReadValue(place.stored->value);
    }
    return ReadValue(simulator.motions.valueAt(*place.stored, simulator.clock.now()));
}

Elements PropertyAccessor::readAll(std::vector<Place> places, DataType type) {
    Elements all = noElements(type);
    for (Place& place : places) {
        append(all, readOne(std::move(place), type, places.size()).elements());
    }
    return all;
}

ReadValue PropertyAccessor::readIn(Category category, std::string_view name, DataType type) {
    return readOne(findIn(category, HashedName(name)), type);
}

ReadValue PropertyAccessor::read(std::string_view resources, std::string_view name, DataType type) {
    const HashedName hashed(name);
    if (isOfSession(hashed)) {
        return readOne(findIn(Category::Session, hashed), type);
    }
    if (Resource* resource = simulator.resolver(session).singleResource(resources)) {
        return readOne(findOn(*resource, hashed), type);
    }
    auto places = findAll(resources, hashed);
    return places.size() == 1 ? readOne(std::move(places.front()), type)
                              : ReadValue(readAll(std::move(places), type));
}

void PropertyAccessor::expectAcceptable(const Place& place, const Elements& value) const {
    const PropertyDefinition& definition = *place.definition;
    if (definition.access == PropertyAccess::ReadOnly) {
        throw about(code::readOnlyProperty, definition, place.resource);
    }
    if (const auto index = definition.firstWithoutItem(value)) {
        throw about(code::valueNotEnumerated, definition, place.resource)
            .usageEnum(tag::requestedValue, std::get<List<std::int32_t>>(value)[*index],
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
    for (std::size_t i = 0; i < places.size(); ++i) {
        expectType(*places[i].definition, type, places.size());
        if (places.size() > 1 && elementCount(values) != places.size()) {
            throw about(code::wrongElementCount, *places[i].definition)
                .usage(tag::valueCount, static_cast<std::uint32_t>(elementCount(values)));
        }
        parts.push_back(places.size() > 1 ? elementAt(values, i) : values);
        expectAcceptable(places[i], parts.back());
    }
    Change change = simulator.lasting.change();
    for (std::size_t i = 0; i < places.size(); ++i) {
        if (places[i].definition->needsCommit && places[i].resource != nullptr) {
            session.writtenDevices.insert(places[i].resource->device);
        }
        if (places[i].stored != nullptr && !places[i].definition->needsCommit) {
            change.property(places[i].resource, *places[i].definition, parts[i]);
        }
    }
    simulator.lasting.keep(change);
    for (std::size_t i = 0; i < places.size(); ++i) {
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

void PropertyAccessor::writeIn(Category category, std::string_view name, DataType type,
                               const Elements& values) {
    writeAll({findIn(category, HashedName(name))}, type, values);
}

void PropertyAccessor::write(std::string_view resources, std::string_view name, DataType type,
                             const Elements& values) {
    writeAll(findAll(resources, HashedName(name)), type, values);
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
    const HashedName hashed(name);
    constexpr Category categories[] = {Category::Session, Category::System, Category::Device,
                                       Category::PhysChan, Category::NvmemArea};
    for (const Category category : categories) {
        if (const auto& definition = simulator.chassis->catalogue.find(category, hashed)) {
            return {session.handle, definition.get(), nullptr};
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
    const Resolver resolver = simulator.resolver(session);
    Resource* owner = resolver.singleResource(resource);
    if (owner == nullptr) {
        const auto found = resolver.anyResources(resource);
        expectOne(found);
        owner = found.front();
    }
    return {session.handle, findOn(*owner, HashedName(name)).definition, owner};
}

}  // namespace simulator
