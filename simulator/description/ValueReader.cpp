#include "description/ValueReader.h"

#include "description/Nearest.h"

namespace simulator {

namespace {

void readElement(const Node& node, List<std::uint8_t>& list) {
    node.expect(node.json().IsBool(), "true or false");
    list.push_back(node.json().GetBool() ? 1 : 0);
}

void readElement(const Node& node, List<double>& list) {
    node.expect(node.json().IsNumber(), "a number");
    list.push_back(node.json().GetDouble());
}

void readElement(const Node& node, List<std::int32_t>& list) {
    list.push_back(node.signedNumber());
}

void readElement(const Node& node, List<std::int64_t>& list) {
    node.expect(node.json().IsInt64(), "a whole number of 64 bits");
    list.push_back(node.json().GetInt64());
}

void readElement(const Node& node, List<std::string>& list) {
    list.push_back(node.text());
}

void readElement(const Node& node, List<std::uint32_t>& list) {
    list.push_back(node.unsignedNumber(0, UINT32_MAX));
}

void readElement(const Node& node, List<std::uint64_t>& list) {
    node.expect(node.json().IsUint64(), "a whole number of 64 bits, not below 0");
    list.push_back(node.json().GetUint64());
}

// "Off (0), On (1)"
std::string itemsOf(const Enumeration& enumeration) {
    std::vector<std::string> items;
    for (const auto& [name, number] : enumeration.items) {
        items.push_back(name + " (" + std::to_string(number) + ")");
    }
    return listed(items);
}

void readItem(const Enumeration& enumeration, const Node& node, Elements& elements) {
    const std::string name = node.text();
    if (const auto number = enumeration.numberOf(name)) {
        std::get<List<std::int32_t>>(elements).push_back(*number);
        return;
    }
    std::vector<std::string> known;
    for (const auto& [item, number] : enumeration.items) {
        known.push_back(item);
    }
    node.fail("is " + node.shown() + ", no item of the enumeration " + enumeration.name,
              perhapsMeant(name, known) + "the items are " + itemsOf(enumeration));
}

void readInto(const PropertyDefinition& definition, const Node& node, Elements& elements) {
    if (definition.enumeration != nullptr && node.json().IsString()) {
        readItem(*definition.enumeration, node, elements);
    } else {
        std::visit([&](auto& list) { readElement(node, list); }, elements);
    }
}

std::string limitWords(const PropertyDefinition& definition) {
    const std::string least = definition.least ? " from " + firstText(*definition.least) : "";
    const std::string most = definition.most ? " up to " + firstText(*definition.most) : "";
    return "must be within the limits of the property," + least + most;
}

// The node of one element of a value.
Node elementNode(const PropertyDefinition& definition, const Node& node, std::size_t index) {
    return isArray(definition.type) ? node.element(index) : node;
}

void expectAllowed(const PropertyDefinition& definition, const Elements& elements,
                   const Node& node) {
    if (const auto index = definition.firstWithoutItem(elements)) {
        const Node place = elementNode(definition, node, *index);
        place.fail(
            "is " + place.shown() + ", no item of the enumeration " + definition.enumeration->name,
            "the items are " + itemsOf(*definition.enumeration));
    }
    if (const auto index = definition.firstOutOfRange(elements)) {
        const Node place = elementNode(definition, node, *index);
        place.fail("is " + place.shown(), limitWords(definition));
    }
}

}  // namespace

Elements readValue(const PropertyDefinition& definition, const Node& node) {
    Elements elements = noElements(definition.type);
    if (isArray(definition.type)) {
        node.forEachElement([&](const Node& element) { readInto(definition, element, elements); });
    } else {
        readInto(definition, node, elements);
    }
    expectAllowed(definition, elements, node);
    return elements;
}

}  // namespace simulator
