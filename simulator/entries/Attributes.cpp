#include "entries/Attributes.h"

#include "status/Refusal.h"

namespace simulator {

namespace {

struct Subject {
    const Simulator& simulator;
    const OpenProperty& property;

    const PropertyDefinition& definition() const { return *property.definition; }
};

struct Entry {
    std::string_view name;
    DataType type;
    bool onlyOfEnumerated;
    Elements (*read)(const Subject& subject);
};

Elements oneText(const std::string& text) {
    return List<std::string>{text};
}
Elements oneText(const std::optional<Elements>& limit) {
    return oneText(limit ? firstText(*limit) : std::string());
}
Elements oneFlag(bool flag) {
    return List<std::uint8_t>{flag};
}

bool isPending(const Resource& resource, const std::string& name) {
    const Property* property = resource.properties.find(name);
    return property != nullptr && property->pending.has_value();
}

Elements pendingChanges(const Subject& subject) {
    const std::string& name = subject.definition().name;
    if (subject.property.resource != nullptr) {
        return oneFlag(isPending(*subject.property.resource, name));
    }
    bool found = false;
    subject.simulator.sessions.forEach([&](const Session& session) {
        for (Device* device : session.writtenDevices) {
            device->forEachResource(
                [&](const Resource& resource) { found = found || isPending(resource, name); });
        }
    });
    return oneFlag(found);
}

Elements itemNames(const Subject& subject) {
    std::vector<std::string> names;
    for (const auto& item : subject.definition().enumeration->items) {
        names.push_back(item.first);
    }
    return names;
}

Elements itemNumbers(const Subject& subject) {
    std::vector<std::int32_t> numbers;
    for (const auto& item : subject.definition().enumeration->items) {
        numbers.push_back(item.second);
    }
    return numbers;
}

constexpr Entry entries[] = {
    {"Prop.DataType", DataType::Int32, false,
     [](const Subject& subject) -> Elements {
         return List<std::int32_t>{static_cast<std::int32_t>(subject.definition().type)};
     }},
    {"Prop.Access", DataType::Int32, false,
     [](const Subject& subject) -> Elements {
         return List<std::int32_t>{static_cast<std::int32_t>(subject.definition().access)};
     }},
    {"Prop.PendingChanges", DataType::Boolean, false, pendingChanges},
    {"Prop.IsEnum", DataType::Boolean, false,
     [](const Subject& subject) { return oneFlag(subject.definition().enumeration != nullptr); }},
    {"Prop.Descr", DataType::Text, false,
     [](const Subject& subject) { return oneText(subject.definition().description); }},
    {"Prop.Doc", DataType::Text, false,
     [](const Subject& subject) { return oneText(subject.definition().document); }},
    {"Prop.Unit", DataType::Text, false,
     [](const Subject& subject) { return oneText(subject.definition().unit); }},
    {"Prop.MinValue", DataType::Text, false,
     [](const Subject& subject) { return oneText(subject.definition().least); }},
    {"Prop.MaxValue", DataType::Text, false,
     [](const Subject& subject) { return oneText(subject.definition().most); }},
    {"Prop.Enum.Name", DataType::Text, true,
     [](const Subject& subject) { return oneText(subject.definition().enumeration->name); }},
    {"Prop.Enum.Values", DataType::Int32Array, true, itemNumbers},
    {"Prop.Enum.ValueNames", DataType::TextArray, true, itemNames},
};

[[noreturn]] void refuse(std::string_view name) {
    throw Refusal(code::unknownAttribute).usage(tag::attribute, name);
}

}  // namespace

Elements attribute(const Simulator& simulator, const OpenProperty& property, std::string_view name,
                   DataType type) {
    for (const Entry& entry : entries) {
        const bool applies = !entry.onlyOfEnumerated || property.definition->enumeration != nullptr;
        if (entry.name == name && entry.type == type && applies) {
            return entry.read({simulator, property});
        }
    }
    refuse(name);
}

const std::string& attribute(const Command& command, std::string_view name) {
    if (name == "Cmd.Descr") {
        return command.description;
    }
    if (name == "Cmd.Doc") {
        return command.document;
    }
    refuse(name);
}

}  // namespace simulator
