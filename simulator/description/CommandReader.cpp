#include "description/CommandReader.h"

#include "Members.h"
#include "description/Nearest.h"
#include "description/PropertyReader.h"
#include "description/StatusReader.h"
#include "description/ValueReader.h"
#include "live/Maths.h"

namespace simulator {

namespace {

using Action = CommandEffect::Action;
using Owner = CommandEffect::Owner;

const Property& effectTarget(const Node& node, const std::string& name, Owner owner,
                             const Resource& resource) {
    const bool ofDevice = owner == Owner::Device;
    const PropertyStore& properties = (ofDevice ? *resource.device : resource).properties;
    const Property* property = properties.find(name);
    if (property == nullptr && ofDevice) {
        node.fail("is not a stored property of the device",
                  perhapsMeant(name, properties.names()) +
                      "on_device changes properties of the device that the resource belongs to");
    }
    if (property == nullptr) {
        node.fail("is not a stored property of the resource",
                  perhapsMeant(name, properties.names()) +
                      "a command changes properties of its own resource");
    }
    return *property;
}

bool isSingleNumber(const PropertyDefinition& definition) {
    return !isArray(definition.type) && definition.type != DataType::Text &&
           definition.type != DataType::Boolean;
}

Elements readAddend(const Node& node, const PropertyDefinition& definition) {
    if (!isSingleNumber(definition)) {
        node.fail("cannot be added to", "only single numbers can");
    }
    PropertyDefinition number;
    number.type = definition.type;
    return readValue(number, node);
}

void readEffects(const Node& node, Owner owner, const Resource& resource, Command& command) {
    node.ifPresent("sets", [&](const Node& values) {
        values.forEachMember([&](const std::string& name, const Node& value) {
            const Property& target = effectTarget(value, name, owner, resource);
            command.effects.push_back(
                {Action::Set, owner, name, readValue(*target.definition, value)});
        });
    });
    node.ifPresent("adds", [&](const Node& numbers) {
        numbers.forEachMember([&](const std::string& name, const Node& number) {
            const Property& target = effectTarget(number, name, owner, resource);
            command.effects.push_back(
                {Action::Add, owner, name, readAddend(number, *target.definition)});
        });
    });
}

CommandFailure::State readState(const Node& node, const Resource& resource) {
    node.expectMembers(members::when);
    const Node nameNode = node.member("property", "the name of a property of the resource");
    const std::string name = nameNode.text();
    const Property* property = resource.properties.find(name);
    if (property == nullptr) {
        nameNode.fail("is not a stored property of the resource",
                      perhapsMeant(name, resource.properties.names()) +
                          "a command looks at properties of its own resource");
    }
    const Node valueNode = node.member("is", "the value at which the command fails");
    return {name, readValue(*property->definition, valueNode)};
}

CommandFailure readFailure(const Node& node, const Resource& resource,
                           const Enumerations& enumerations) {
    node.expectMembers(members::failure);
    CommandFailure failure{
        readStatus(node.member("status", "the status that the command gives"), enumerations)};
    node.ifPresent("when", [&](const Node& state) { failure.when = readState(state, resource); });
    node.ifPresent("probability", [&](const Node& number) {
        const JsonValue& json = number.json();
        number.expect(json.IsNumber() && json.GetDouble() >= 0.0 && json.GetDouble() <= 1.0,
                      "a number from 0 to 1");
        failure.probability = json.GetDouble();
    });
    node.ifPresent("every",
                   [&](const Node& count) { failure.every = count.unsignedNumber(1, UINT32_MAX); });
    return failure;
}

}  // namespace

Command readCommand(const std::string& name, const Node& node, const Resource& resource,
                    const Enumerations& enumerations) {
    node.expectMembers(members::command);
    Command command;
    command.name = name;
    command.number = keyOf(resource.fullName() + "/" + name);
    node.ifPresent("description", [&](const Node& text) { command.description = text.text(); });
    node.ifPresent("document", [&](const Node& text) { command.document = text.text(); });
    node.ifPresent("seconds", [&](const Node& time) { command.seconds = time.seconds(); });
    node.ifPresent("resets", [&](const Node& resets) { command.resets = resets.flag(); });
    readEffects(node, Owner::Resource, resource, command);
    node.ifPresent("on_device", [&](const Node& effects) {
        effects.expectMembers(members::onDevice);
        readEffects(effects, Owner::Device, resource, command);
    });
    node.ifPresent("fails", [&](const Node& failure) {
        command.fails = readFailure(failure, resource, enumerations);
    });
    return command;
}

}  // namespace simulator
