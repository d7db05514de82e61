#include "description/PropertyFile.h"

#include <algorithm>
#include <array>
#include <utility>

namespace simulator {

namespace {

constexpr uint32_t firstEnumerationId = 0x1000;

constexpr std::array<std::pair<const char*, Category>, 5> categories{{
    {"system", Category::system},
    {"session", Category::session},
    {"device", Category::device},
    {"phys_chan", Category::physChan},
    {"nvmem_area", Category::nvmemArea},
}};

void readElement(const Node& node, List<uint8_t>& list) {
    node.expect(node.json().IsBool(), "true or false");
    list.push_back(node.json().GetBool() ? 1 : 0);
}

void readElement(const Node& node, List<double>& list) {
    node.expect(node.json().IsNumber(), "a number");
    list.push_back(node.json().GetDouble());
}

void readElement(const Node& node, List<int32_t>& list) {
    list.push_back(node.signedNumber());
}

void readElement(const Node& node, List<int64_t>& list) {
    node.expect(node.json().IsInt64(), "a whole number of 64 bits");
    list.push_back(node.json().GetInt64());
}

void readElement(const Node& node, List<std::string>& list) {
    list.push_back(node.text());
}

void readElement(const Node& node, List<uint32_t>& list) {
    list.push_back(node.unsignedNumber(0, UINT32_MAX));
}

void readElement(const Node& node, List<uint64_t>& list) {
    node.expect(node.json().IsUint64(), "a whole number of 64 bits, not below 0");
    list.push_back(node.json().GetUint64());
}

void readItem(const Enumeration& enumeration, const Node& node, Elements& elements) {
    const std::string name = node.text();
    for (const auto& [item, number] : enumeration.items) {
        if (item == name) {
            std::get<List<int32_t>>(elements).push_back(number);
            return;
        }
    }
    node.fail("is not an item of the enumeration", "must be an item of " + enumeration.name);
}

void readInto(const PropertyDefinition& definition, const Node& node, Elements& elements) {
    if (definition.enumeration != nullptr && node.json().IsString()) {
        readItem(*definition.enumeration, node, elements);
    } else {
        std::visit([&](auto& list) { readElement(node, list); }, elements);
    }
}

bool isNumeric(DataType type) {
    return elementType(type) != DataType::boolean && elementType(type) != DataType::text;
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
    Elements elements = noElements(definition.type);
    std::visit([&](auto& list) { readElement(limit, list); }, elements);
    return elements;
}

PropertyAccess readAccess(const Node& node) {
    if (!node.has("access")) {
        return PropertyAccess::readOnly;
    }
    const Node access = node.member("access", "");
    const std::string name = access.text();
    if (name == "ReadOnly") {
        return PropertyAccess::readOnly;
    }
    if (name == "WriteOnly") {
        return PropertyAccess::writeOnly;
    }
    access.expect(name == "ReadWrite", "ReadOnly, WriteOnly or ReadWrite");
    return PropertyAccess::readWrite;
}

DataType readType(const Node& node) {
    const Node typeNode = node.member("type", "a data type");
    const auto type = typeNamed(typeNode.text());
    typeNode.expect(type.has_value(),
                    "Bool, Double, Int32, Int64, String, UInt32 or UInt64, or one of these "
                    "with Array behind it");
    return *type;
}

std::shared_ptr<const Enumeration> readEnumerationOf(const PropertyDefinition& definition,
                                                     const Node& node,
                                                     const Enumerations& enumerations) {
    if (!node.has("enum")) {
        return nullptr;
    }
    const Node nameNode = node.member("enum", "");
    const auto found = enumerations.find(nameNode.text());
    if (found == enumerations.end()) {
        nameNode.fail("is not a known enumeration", "must be a member of /enums");
    }
    if (elementType(definition.type) != DataType::int32) {
        nameNode.fail("enumerates what is no Int32", "the type must be Int32 or Int32Array");
    }
    return found->second;
}

void addToCatalogue(const std::string& name, const Node& node, Category category,
                    const Enumerations& enumerations, Catalogue& catalogue) {
    if (catalogue.find(category, name) != nullptr) {
        node.fail("is defined already", "each property is defined once");
    }
    const auto definition =
        std::make_shared<const PropertyDefinition>(readDefinition(name, node, enumerations));
    const bool ofResource = category != Category::system && category != Category::session;
    if (definition->needsCommit && !ofResource) {
        node.fail("can never be committed", "only properties of resources are committed");
    }
    if (definition->lasting && category == Category::session) {
        node.fail("can never last", "sessions end, and their properties with them");
    }
    catalogue.add(category, definition);
}

}  // namespace

Enumerations readEnumerations(const Node& node) {
    Enumerations enumerations;
    node.forEachMember([&](const std::string& name, const Node& itemsNode) {
        auto enumeration = std::make_shared<Enumeration>();
        enumeration->name = name;
        enumeration->id = firstEnumerationId + static_cast<uint32_t>(enumerations.size());
        itemsNode.forEachMember([&](const std::string& item, const Node& number) {
            enumeration->items.emplace_back(item, number.signedNumber());
        });
        enumerations.emplace(name, std::move(enumeration));
    });
    return enumerations;
}

Elements readValue(const PropertyDefinition& definition, const Node& node) {
    Elements elements = noElements(definition.type);
    if (isArray(definition.type)) {
        node.forEachElement([&](const Node& element) { readInto(definition, element, elements); });
    } else {
        readInto(definition, node, elements);
    }
    if (definition.firstWithoutItem(elements)) {
        node.fail("is not an item of the enumeration",
                  "must be an item of " + definition.enumeration->name);
    }
    if (definition.firstOutOfRange(elements)) {
        node.fail("is out of range", "must be within the limits of the property");
    }
    return elements;
}

PropertyDefinition readDefinition(const std::string& name, const Node& node,
                                  const Enumerations& enumerations) {
    node.expectMembers({"type", "access", "computed", "needs_commit", "lasting", "description",
                        "document", "unit", "min", "max", "enum", "value"});
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
    definition.enumeration = readEnumerationOf(definition, node, enumerations);
    node.ifPresent("value",
                   [&](const Node& value) { definition.initial = readValue(definition, value); });
    return definition;
}

void readCatalogue(const Node& node, const Enumerations& enumerations, Catalogue& catalogue) {
    node.expectMembers({"system", "session", "device", "phys_chan", "nvmem_area"});
    for (const auto& [member, category] : categories) {
        node.ifPresent(member, [&, category = category](const Node& definitions) {
            definitions.forEachMember([&](const std::string& name, const Node& entry) {
                addToCatalogue(name, entry, category, enumerations, catalogue);
            });
        });
    }
}

void fillStore(Category category, const Catalogue& catalogue, const Node* values,
               PropertyStore& store) {
    if (values != nullptr) {
        values->forEachMember([&](const std::string& name, const Node& value) {
            const DefinitionPointer definition = catalogue.find(category, name);
            if (definition == nullptr || definition->computed) {
                value.fail("is not a property whose value can be given",
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
        if (name.empty() || catalogue.find(category, name) != nullptr ||
            store.find(name) != nullptr) {
            entry.fail("is no name for a property of its own",
                       "must not be empty, nor a property that there is already");
        }
        if (definition->computed) {
            entry.fail("claims to be computed", "only built-in properties are computed");
        }
        if (!definition->initial) {
            entry.fail("has no value", "must give a value");
        }
        store.addOwn(definition);
    });
}

}  // namespace simulator
