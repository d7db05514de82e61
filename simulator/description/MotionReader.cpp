#include "description/MotionReader.h"

#include <array>
#include <utility>

#include "Members.h"
#include "description/Nearest.h"
#include "live/Maths.h"

namespace simulator {

namespace {

constexpr double shortestPeriod = 0.001;
constexpr double longestPeriod = 1e9;
constexpr double highestFrequency = 1e12;
constexpr double highestCountRate = 1e9;
constexpr double day = 24.0 * 60.0 * 60.0;

constexpr std::array<std::pair<const char*, Waveform::Shape>, 6> shapes{{
    {"dc", Waveform::Shape::Dc},
    {"noise", Waveform::Shape::Noise},
    {"sawtooth", Waveform::Shape::Sawtooth},
    {"sine", Waveform::Shape::Sine},
    {"square", Waveform::Shape::Square},
    {"triangle", Waveform::Shape::Triangle},
}};

bool isNumber(DataType type) {
    return !isArray(type) && type != DataType::Boolean && type != DataType::Text;
}

bool isWholeNumber(DataType type) {
    return isNumber(type) && type != DataType::Real;
}

bool isRecord(DataType type) {
    return type == DataType::RealArray || type == DataType::Int32Array;
}

void readNumber(const Node& node, const char* name, double least, double most, double& number) {
    node.ifPresent(name, [&](const Node& member) { number = member.number(least, most); });
}

void expectType(const Node& node, bool suits, const PropertyDefinition& definition,
                const char* right) {
    if (!suits) {
        node.fail("does not suit a property of type " + typeName(definition.type), right);
    }
}

std::string withNumber(std::string name, const std::string& number) {
    constexpr std::string_view placeholder = "{n}";
    const std::size_t found = number.empty() ? std::string::npos : name.find(placeholder);
    return found == std::string::npos ? name : name.replace(found, placeholder.size(), number);
}

const Property& propertyOf(const Resource& resource, const Node& node) {
    const Property* property = resource.properties.find(node.text());
    if (property == nullptr) {
        node.fail("is not a stored property of " + resource.fullName(),
                  perhapsMeant(node.text(), resource.properties.names()) +
                      "must be a property that holds a value");
    }
    return *property;
}

// Reads "follows" into the motion.
class FollowsReader {
  public:
    FollowsReader(const Node& node, const MotionPlace& place, const Chassis& chassis)
        : node(node), place(place), chassis(chassis) {}

    void read(ReadMotion& into) const;

  private:
    // Null when the resource is not there and need not be.
    const Resource* followed() const;

    const Node& node;
    const MotionPlace& place;
    const Chassis& chassis;
};

const Resource* FollowsReader::followed() const {
    bool optional = false;
    node.ifPresent("optional", [&](const Node& flag) { optional = flag.flag(); });
    if (!node.has("resource")) {
        return &place.resource;
    }
    const Node nameNode = node.member("resource", "");
    const std::string name = withNumber(nameNode.text(), place.number);
    const Resource* found = chassis.find(name);
    if (found == nullptr && !optional) {
        nameNode.fail("is not a known resource: " + name,
                      "must be the full name of a device, a channel or an NVMEM area, or optional");
    }
    return found;
}

void FollowsReader::read(ReadMotion& into) const {
    node.expectMembers(members::follows);
    Follows follows;
    readNumber(node, "factor", -largestFinite, largestFinite, follows.factor);
    readNumber(node, "offset", -largestFinite, largestFinite, follows.offset);
    readNumber(node, "time_constant", 0.0, day, follows.timeConstant);
    const Node propertyNode = node.member("property", "the name of a property");
    propertyNode.text();
    node.ifPresent("while", [](const Node& name) { name.text(); });
    into.followed = followed();
    if (into.followed == nullptr) {
        return;
    }
    follows.source = &propertyOf(*into.followed, propertyNode);
    expectType(propertyNode, isNumber(follows.source->definition->type),
               *follows.source->definition, "only a single number can be followed");
    node.ifPresent("while", [&](const Node& name) {
        follows.condition = &propertyOf(*into.followed, name);
        const PropertyDefinition& definition = *follows.condition->definition;
        expectType(name, definition.type == DataType::Boolean, definition, "must be a Bool");
    });
    into.motion.follows = follows;
}

Drift readDrift(const Node& node) {
    node.expectMembers(members::drift);
    Drift drift;
    drift.amplitude = node.member("amplitude", "how far it goes").number(0.0, largestFinite);
    drift.period = node.member("period", "a time in seconds").number(shortestPeriod, longestPeriod);
    return drift;
}

Counts readCounts(const Node& node) {
    node.expectMembers(members::counts);
    return {node.member("per_second", "how many are counted in a second")
                .number(0.0, highestCountRate)};
}

// A number, or the name of a property of the resource or its device.
Quantity readQuantity(const Node& node, const MotionPlace& place, double least, double most) {
    Quantity quantity;
    if (!node.json().IsString()) {
        quantity.constant = node.number(least, most);
        return quantity;
    }
    const bool own = place.resource.properties.find(node.text()) != nullptr;
    quantity.property = &propertyOf(own ? place.resource : *place.resource.device, node);
    const PropertyDefinition& definition = *quantity.property->definition;
    expectType(node, isNumber(definition.type), definition, "must be a single number");
    return quantity;
}

Waveform::Shape readShape(const Node& node) {
    const std::string name = node.text();
    for (const auto& [known, shape] : shapes) {
        if (name == known) {
            return shape;
        }
    }
    std::vector<std::string> known;
    for (const auto& [shape, value] : shapes) {
        known.emplace_back(shape);
    }
    node.fail("is not a known shape",
              perhapsMeant(name, known) + "must be dc, noise, sawtooth, sine, square or triangle");
}

Waveform readWaveform(const Node& node, const MotionPlace& place) {
    node.expectMembers(members::waveform);
    Waveform waveform;
    waveform.shape = readShape(node.member("shape", "the name of a shape"));
    readNumber(node, "frequency", 0.0, highestFrequency, waveform.frequency);
    readNumber(node, "amplitude", -largestFinite, largestFinite, waveform.amplitude);
    readNumber(node, "offset", -largestFinite, largestFinite, waveform.offset);
    waveform.samples = readQuantity(node.member("samples", "a number, or the name of a property"),
                                    place, 0.0, mostSamples);
    waveform.sampleRate =
        readQuantity(node.member("sample_rate", "a number, or the name of a property"), place,
                     1.0 / highestFrequency, highestFrequency);
    return waveform;
}

void expectCompany(const Node& node, const PropertyDefinition& definition) {
    if (node.json().MemberCount() == 0) {
        node.fail("does not move", "must hold follows, drift, noise, counts or waveform");
    }
    if (node.has("counts") && node.json().MemberCount() > 1) {
        node.fail("counts and moves otherwise too", "counts stands alone");
    }
    if (node.has("waveform") && (node.has("follows") || node.has("drift"))) {
        node.fail("is a waveform and moves otherwise too", "a waveform goes with noise alone");
    }
    if (definition.enumeration != nullptr) {
        node.fail("moves an enumeration", "only numbers that stand for themselves move");
    }
}

void expectSuitableType(const Node& node, const PropertyDefinition& definition) {
    const DataType type = definition.type;
    if (node.has("waveform")) {
        expectType(node.member("waveform", ""), isRecord(type), definition,
                   "a waveform is a DoubleArray or an Int32Array");
    } else if (node.has("counts")) {
        expectType(node.member("counts", ""), isWholeNumber(type), definition,
                   "only whole numbers count");
        if (definition.access != PropertyAccess::ReadOnly) {
            node.member("counts", "")
                .fail("counts in a property that can be written", "the access must be ReadOnly");
        }
    } else {
        expectType(node, isNumber(type), definition, "only a single number moves like this");
    }
}

}  // namespace

ReadMotion readMotion(const Node& node, const MotionPlace& place,
                      const PropertyDefinition& definition, const Chassis& chassis) {
    node.expectMembers(members::motion);
    expectCompany(node, definition);
    expectSuitableType(node, definition);
    ReadMotion read;
    Motion& motion = read.motion;
    motion.key = keyOf(place.resource.fullName() + " " + definition.name);
    node.ifPresent("follows",
                   [&](const Node& follows) { FollowsReader(follows, place, chassis).read(read); });
    node.ifPresent("drift", [&](const Node& drift) { motion.drift = readDrift(drift); });
    readNumber(node, "noise", 0.0, largestFinite, motion.noise);
    node.ifPresent("counts", [&](const Node& counts) { motion.counts = readCounts(counts); });
    node.ifPresent("waveform",
                   [&](const Node& wave) { motion.waveform = readWaveform(wave, place); });
    return read;
}

}  // namespace simulator
