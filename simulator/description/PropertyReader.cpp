#include "description/PropertyReader.h"

#include <algorithm>
#include <array>
#include <utility>

#include "Members.h"
#include "description/Nearest.h"
#include "description/ValueReader.h"

namespace simulator {

namespace {

constexpr std::uint32_t firstEnumerationId = 0x1000;

constexpr std::array<std::pair<const char*, Category>, 5> categories{{
    {"system", Category::System},
    {"session", Category::Session},
    {"device", Category::Device},
    {"phys_chan", Category::PhysChan},
    {"nvmem_area", Category::NvmemArea},
}};

bool isNumeric(DataType type) {
    return elementType(type) != DataType::Boolean && elementType(type) != DataType::Text;
}

std::optional<Elements> readLimit(const char* member, const PropertyDefinition& definition,
                                  const Node& node) {
    if (!node.has(member)) {
        return std::nullopt;
    }
    const Node limit = node.member(member, "");
    if (!isNumeric(definition.type)) {
        limit.fail("limits what is no number", "only numbers have limits");
    }
    PropertyDefinition number;
    number.type = elementType(definition.type);
    return readValue(number, limit);
}

void expectOrder(const PropertyDefinition& definition, const Node& node) {
    if (definition.least && definition.most && definition.firstOutOfRange(*definition.least)) {
        const Node limit = node.member("min", "");
        limit.fail("is " + limit.shown() + ", and above max", "must not be above max");
    }
}

PropertyAccess readAccess(const Node& node) {
    if (!node.has("access")) {
        return PropertyAccess::ReadOnly;
    }
    const Node access = node.member("access", "");
    const std::string name = access.text();
    if (name == "ReadOnly") {
        return PropertyAccess::ReadOnly;
    }
    if (name == "WriteOnly") {
        return PropertyAccess::WriteOnly;
    }
    if (name != "ReadWrite") {
        access.fail("is " + access.shown(),
                    perhapsMeant(name, {"ReadOnly", "WriteOnly", "ReadWrite"}) +
                        "must be ReadOnly, WriteOnly or ReadWrite");
    }
    return PropertyAccess::ReadWrite;
}

constexpr const char* typeWords =
    "Bool, Double, Int32, Int64, String, UInt32 or UInt64, or one of these with Array behind it";

std::vector<std::string> typeNames() {
    std::vector<std::string> names;
    for (auto number = static_cast<std::int32_t>(DataType::Boolean);
         number <= static_cast<std::int32_t>(DataType::Uint64Array); ++number) {
        names.push_back(typeName(static_cast<DataType>(number)));
    }
    return names;
}

DataType readType(const Node& node) {
    const Node typeNode = node.member("type", typeWords);
    const std::string name = typeNode.text();
    const auto type = typeNamed(name);
    if (!type) {
        typeNode.fail("is " + typeNode.shown(),
                      perhapsMeant(name, typeNames()) + "must be " + typeWords);
    }
    return *type;
}

std::shared_ptr<const Enumeration> readEnumerationOf(const PropertyDefinition& definition,
                                                     const Node& node,
                                                     const Enumerations& enumerations) {
    if (!node.has("enum")) {
        return nullptr;
    }
    const Node nameNode = node.member("enum", "");
    const std::string name = nameNode.text();
    const auto found = enumerations.find(name);
    if (found == enumerations.end()) {
        std::vector<std::string> known;
        for (const auto& [other, enumeration] : enumerations) {
            known.push_back(other);
        }
        nameNode.fail("is " + nameNode.shown() + ", which is not a known enumeration",
                      perhapsMeant(name, known) + "must be a member of /enums");
    }
    if (elementType(definition.type) != DataType::Int32) {
        nameNode.fail("enumerates what is no Int32", "the type must be Int32 or Int32Array");
    }
    return found->second;
}

// What is computed comes from the driver alone.
void expectStored(const Node& node) {
    node.ifPresent("computed", [](const Node& flag) {
        flag.fail("is for built-in properties alone", "must be left out");
    });
}

std::vector<std::string> storedNames(Category category, const Catalogue& catalogue) {
    std::vector<std::string> names;
    for (const DefinitionPointer& definition : catalogue.definitions(category)) {
        if (!definition->computed) {
            names.push_back(definition->name);
        }
    }
    return names;
}

void addToCatalogue(const std::string& name, const Node& node, Category category,
                    const Enumerations& enumerations, Origin origin, Catalogue& catalogue) {
    expectWritableName(name, node);
    if (catalogue.find(category, name) != nullptr) {
        node.fail("is defined already", "each property is defined once");
    }
    const auto definition =
        std::make_shared<const PropertyDefinition>(readDefinition(name, node, enumerations));
    if (origin == Origin::File) {
        expectStored(node);
    }
    const bool ofResource = category != Category::System && category != Category::Session;
    if (definition->needsCommit && !ofResource) {
        node.fail("can never be committed", "only properties of resources are committed");
    }
    if (definition->lasting && category == Category::Session) {
        node.fail("can never last", "sessions end, and their properties with them");
    }
    catalogue.add(category, definition);
}

}  // namespace

void expectWritableName(const std::string& name, const Node& node) {
    if (name.empty() || name.find('\0') != std::string::npos) {
        node.fail("has no name that can be written", "must not be empty nor hold a NUL character");
    }
}

Enumerations readEnumerations(const Node& node) {
    Enumerations enumerations;
    node.forEachMember([&](const std::string& name, const Node& itemsNode) {
        expectWritableName(name, itemsNode);
        auto enumeration = std::make_shared<Enumeration>();
        enumeration->name = name;
        enumeration->id = firstEnumerationId + static_cast<std::uint32_t>(enumerations.size());
        itemsNode.forEachMember([&](const std::string& item, const Node& number) {
            expectWritableName(item, number);
            enumeration->add(item, number.signedNumber());
        });
        enumerations.emplace(name, std::move(enumeration));
    });
    return enumerations;
}

PropertyDefinition readDefinition(const std::string& name, const Node& node,
                                  const Enumerations& enumerations) {
    node.expectMembers(members::property);
    PropertyDefinition definition;
    definition.name = name;
    definition.type = readType(node);
    definition.access = readAccess(node);
    node.ifPresent("computed", [&](const Node& flag) { definition.computed = flag.flag(); });
    node.ifPresent("needs_commit", [&](const Node& flag) { definition.needsCommit = flag.flag(); });
    node.ifPresent("lasting", [&](const Node& flag) { definition.lasting = flag.flag(); });
    node.ifPresent("description", [&](const Node& text) { definition.description = text.text(); });
    node.ifPresent("document", [&](const Node& text) { definition.document = text.text(); });
    node.ifPresent("unit", [&](const Node& text) { definition.unit = text.text(); });
    definition.least = readLimit("min", definition, node);
    definition.most = readLimit("max", definition, node);
    expectOrder(definition, node);
    definition.enumeration = readEnumerationOf(definition, node, enumerations);
    node.ifPresent("value",
                   [&](const Node& value) { definition.initial = readValue(definition, value); });
    return definition;
}

void readCatalogue(const Node& node, const Enumerations& enumerations, Origin origin,
                   Catalogue& catalogue) {
    node.expectMembers(members::driverProperties);
    for (const auto& [member, category] : categories) {
        node.ifPresent(member, [&, category = category](const Node& definitions) {
            definitions.forEachMember([&](const std::string& name, const Node& entry) {
                addToCatalogue(name, entry, category, enumerations, origin, catalogue);
            });
        });
    }
}

void fillStore(Category category, const Catalogue& catalogue, const Node* values,
               PropertyStore& store) {
    if (values != nullptr) {
        values->forEachMember([&](const std::string& name, const Node& value) {
            const DefinitionPointer& definition = catalogue.find(category, name);
            if (definition == nullptr || definition->computed) {
                value.fail("is not a property whose value can be given",
                           perhapsMeant(name, storedNames(category, catalogue)) +
                               "must be a stored property that the driver defines for this kind");
            }
            store.add(definition, readValue(*definition, value));
        });
    }
    for (const DefinitionPointer& definition : catalogue.definitions(category)) {
        if (!definition->computed && definition->initial) {
            store.add(definition, *definition->initial);
        }
    }
}

void addOwnProperties(const Node& node, Category category, const Catalogue& catalogue,
                      const Enumerations& enumerations, PropertyStore& store) {
    node.forEachMember([&](const std::string& name, const Node& entry) {
        auto definition =
            std::make_shared<PropertyDefinition>(readDefinition(name, entry, enumerations));
        expectWritableName(name, entry);
        if (catalogue.find(category, name) != nullptr || store.find(name) != nullptr) {
            entry.fail("is no name for a property of its own",
                       "must not be a property that the driver defines itself");
        }
        expectStored(entry);
        if (!definition->initial) {
            entry.fail("has no value", "must give a value");
        }
        store.addOwn(definition);
    });
}

}  // namespace simulator
