#include "faults/FaultReader.h"

#include <algorithm>

#include "DriverFunctions.h"
#include "Members.h"
#include "MethodFunctions.h"
#include "description/Description.h"
#include "description/Nearest.h"
#include "description/StatusReader.h"

namespace simulator {

namespace {

constexpr std::uint32_t mostBytes = 1u << 30;
constexpr std::uint32_t mostElements = 1u << 24;

// A function name without the common prefix, which it may have.
std::string_view nameOf(std::string_view text) {
    constexpr std::string_view prefix = "nQITRMCAPI100_";
    return text.substr(0, prefix.size()) == prefix ? text.substr(prefix.size()) : text;
}

void readFunction(const Node& node, Fault& fault) {
    std::string name = node.text();
    fault.isBeginning = !name.empty() && name.back() == '*';
    if (fault.isBeginning) {
        name.pop_back();
    }
    fault.function = std::move(name);
    if (std::none_of(std::begin(driverFunctions), std::end(driverFunctions),
                     [&](std::string_view known) { return fault.matchesFunction(known); })) {
        node.fail("is not a function of the driver that has a status",
                  perhapsMeant(nameOf(node.text()),
                               {std::begin(driverFunctions), std::end(driverFunctions)}) +
                      "must be the name of one without nQITRMCAPI100_, or its beginning with a "
                      "star");
    }
}

void readMethod(const Node& node, Fault& fault) {
    fault.method = node.text();
    std::vector<std::string> known;
    for (const MethodFunction& row : methodFunctions) {
        if (known.empty() || known.back() != row.method) {
            known.emplace_back(row.method);
        }
    }
    if (std::find(known.begin(), known.end(), fault.method) == known.end()) {
        node.fail("is not a method of the service",
                  perhapsMeant(fault.method, known) + "must be the name of one");
    }
}

// When something begins and ends.
template <typename Timed>
void readTimes(const Node& node, Timed& timed) {
    node.ifPresent("after", [&](const Node& time) { timed.begin = time.seconds(); });
    node.ifPresent("lasts", [&](const Node& time) { timed.end = timed.begin + time.seconds(); });
}

// By its present name, or else by its name in the description, which it has again in a file that
// was written before it was renamed.
const Resource* findResource(const Chassis& chassis, std::string_view name) {
    const Resource* resource = chassis.find(name);
    return resource != nullptr ? resource : chassis.findDescribed(name);
}

const Resource& readResource(const Node& node, const Chassis& chassis) {
    const Resource* resource = findResource(chassis, node.text());
    if (resource == nullptr) {
        node.fail("is not a resource of the chassis",
                  "must be the name of a device, or of a channel or area such as Mod1/ch0");
    }
    return *resource;
}

void readTurns(const Node& node, Fault& fault) {
    node.expectMembers(members::calls);
    const auto read = [&](const char* name, std::uint64_t& number) {
        node.ifPresent(name,
                       [&](const Node& value) { number = value.unsignedNumber(1, UINT32_MAX); });
    };
    read("first", fault.first);
    read("count", fault.count);
    read("every", fault.every);
}

double readProbability(const Node& node) {
    const JsonValue& json = node.json();
    node.expect(json.IsNumber() && json.GetDouble() >= 0.0 && json.GetDouble() <= 1.0,
                "a number from 0 to 1");
    return json.GetDouble();
}

bool readIsAfter(const Node& node) {
    const std::string moment = node.text();
    node.expect(moment == "before" || moment == "after", "before or after");
    return moment == "after";
}

OutputFault readOutput(const Node& node) {
    node.expectMembers(members::output);
    OutputFault output;
    node.ifPresent("null", [&](const Node& flag) { output.isNull = flag.flag(); });
    node.ifPresent("null_items", [&](const Node& flag) { output.hasNullItems = flag.flag(); });
    node.ifPresent("text_size",
                   [&](const Node& size) { output.textSize = size.unsignedNumber(0, mostBytes); });
    node.ifPresent("count", [&](const Node& count) {
        output.count = count.unsignedNumber(0, output.isNull ? UINT32_MAX : mostElements);
    });
    if (int{output.isNull} + int{output.hasNullItems} + int{output.textSize.has_value()} > 1) {
        node.fail("says several things about one text",
                  "must have one of null, null_items and text_size");
    }
    if (!output.isNull && !output.hasNullItems && !output.textSize && !output.count) {
        node.fail("changes nothing", "must have null, null_items, text_size or count");
    }
    if (output.textSize && output.count &&
        std::uint64_t{*output.textSize} * *output.count > mostBytes) {
        node.fail("is too large", "text_size times count must be at most 1073741824");
    }
    return output;
}

// Makes sure that the members of a fault go together.
void expectSense(const Node& node, const Fault& fault) {
    const bool fails = fault.status && fault.status->code() < 0;
    if (!node.has("delay") && !fault.status && !fault.output) {
        node.fail("does nothing", "must have delay, status or output");
    }
    if (node.has("function") && node.has("method")) {
        node.member("method", "").fail("stands beside a function", "must be without one");
    }
    if (node.has("moment") && !fails) {
        node.member("moment", "")
            .fail("belongs to no failure",
                  "only with a status below 0 there is a moment of failing");
    }
    if (fault.output && fails) {
        node.member("output", "")
            .fail("belongs to a call that fails", "a call that fails gives nothing out");
    }
}

Fault readFault(const Node& node, const Chassis& chassis) {
    node.expectMembers(members::fault);
    Fault fault;
    node.ifPresent("function", [&](const Node& name) { readFunction(name, fault); });
    node.ifPresent("method", [&](const Node& name) { readMethod(name, fault); });
    node.ifPresent("resource",
                   [&](const Node& name) { fault.resource = &readResource(name, chassis); });
    node.ifPresent("calls", [&](const Node& turns) { readTurns(turns, fault); });
    node.ifPresent("probability",
                   [&](const Node& number) { fault.probability = readProbability(number); });
    readTimes(node, fault);
    node.ifPresent("delay", [&](const Node& time) { fault.delay = time.seconds(); });
    node.ifPresent("status", [&](const Node& status) {
        fault.status = readStatus(status, chassis.enumerations);
    });
    node.ifPresent("moment",
                   [&](const Node& moment) { fault.failsAfterwards = readIsAfter(moment); });
    node.ifPresent("output", [&](const Node& output) { fault.output = readOutput(output); });
    expectSense(node, fault);
    return fault;
}

const Device& readDevice(const Node& node, const Chassis& chassis) {
    const Resource* found = findResource(chassis, node.text());
    const Device* device =
        found != nullptr && found->kind == Kind::Device ? found->device : nullptr;
    if (device == nullptr) {
        node.fail("is not a device of the chassis", "must be the name of one");
    }
    return *device;
}

Absence readAbsence(const Node& node, const Device& device) {
    const std::string name = node.text();
    node.expect(name == "pulled" || name == "connection_lost", "pulled or connection_lost");
    if (name == "connection_lost") {
        return Absence::ConnectionLost;
    }
    if (device.slot == 0) {
        node.fail("befalls a device that is no module", "only what stands in a slot can be pulled");
    }
    return Absence::Removed;
}

DeviceEvent readEvent(const Node& node, const Chassis& chassis) {
    node.expectMembers(members::event);
    const Device& device = readDevice(node.member("device", "the name of a device"), chassis);
    DeviceEvent event{&device,
                      readAbsence(node.member("event", "pulled or connection_lost"), device), 0.0,
                      std::numeric_limits<double>::infinity()};
    readTimes(node, event);
    return event;
}

}  // namespace

FaultPlan readFaults(std::string_view text, const Chassis& chassis) {
    JsonDocument document;
    parseDescription(text, document, "a description of faults");
    const Node root(document);
    root.expectMembers(members::faults);
    FaultPlan plan;
    plan.text = text;
    root.ifPresent("$schema", [](const Node& schema) { schema.text(); });
    root.ifPresent("seed",
                   [&](const Node& seed) { plan.seed = seed.unsignedNumber(0, UINT32_MAX); });
    root.ifPresent("faults", [&](const Node& faults) {
        faults.forEachElement(
            [&](const Node& fault) { plan.faults.push_back(readFault(fault, chassis)); });
    });
    root.ifPresent("events", [&](const Node& events) {
        events.forEachElement(
            [&](const Node& event) { plan.events.push_back(readEvent(event, chassis)); });
    });
    return plan;
}

}  // namespace simulator
