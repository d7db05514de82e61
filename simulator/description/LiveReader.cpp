#include "description/LiveReader.h"

#include "description/MotionReader.h"
#include "description/Nearest.h"

namespace simulator {

namespace {

constexpr std::size_t longestChain = 16;

// What was read, to be looked at when all of it is there.
struct Moving {
    Node node;
    const Property* property;
};

// Reads the motions of one description.
class MotionsReader {
  public:
    MotionsReader(const Chassis& chassis, Motions& motions) : chassis(chassis), motions(motions) {}

    void readDevice(const Node& node);
    void expectSoundChains() const;

  private:
    void readResource(const Node& live, const MotionPlace& place);
    void expectSoundChain(const Moving& moving) const;

    const Chassis& chassis;
    Motions& motions;
    std::vector<Moving> all;
};

void MotionsReader::readResource(const Node& live, const MotionPlace& place) {
    live.forEachMember([&](const std::string& name, const Node& node) {
        const Property* property = place.resource.properties.find(name);
        if (property == nullptr) {
            node.fail("is not a stored property of the resource",
                      perhapsMeant(name, place.resource.properties.names()) +
                          "only properties that the resource has and that hold a value can move");
        }
        const ReadMotion read = readMotion(node, place, *property->definition, chassis);
        motions.add(place.resource, *property, read.motion, read.followed);
        all.push_back({node, property});
    });
}

void MotionsReader::readDevice(const Node& node) {
    const Device& device = *chassis.findDevice(node.member("name", "").text());
    node.ifPresent("live", [&](const Node& live) { readResource(live, {device, ""}); });
    node.ifPresent("channels", [&](const Node& channels) {
        channels.ifPresent("live", [&](const Node& live) {
            for (std::size_t i = 0; i < device.physChans.size(); ++i) {
                readResource(live, {*device.physChans[i], std::to_string(i)});
            }
        });
    });
    node.ifPresent("modules", [&](const Node& modules) {
        modules.forEachElement([&](const Node& element) { readDevice(element); });
    });
}

void MotionsReader::expectSoundChain(const Moving& moving) const {
    const Motion* motion = motions.find(*moving.property);
    if (!motion->follows) {
        return;
    }
    const Node follows = moving.node.member("follows", "");
    const Motion* next = motions.find(*motion->follows->source);
    if (motion->follows->timeConstant > 0.0 && next != nullptr) {
        follows.fail("follows a property that moves itself, with a time constant",
                     "leave time_constant out, or follow a property that keeps still");
    }
    for (std::size_t length = 1; next != nullptr && next->follows; ++length) {
        if (next == motion) {
            follows.fail("follows itself", "must not go round in a circle");
        }
        if (length == longestChain) {
            follows.fail("follows over more than 16 properties",
                         "must be a shorter chain, and no circle");
        }
        next = motions.find(*next->follows->source);
    }
}

void MotionsReader::expectSoundChains() const {
    for (const Moving& moving : all) {
        expectSoundChain(moving);
    }
}

}  // namespace

void readMotions(const Node& root, const Chassis& chassis, Motions& motions) {
    MotionsReader reader(chassis, motions);
    root.member("devices", "").forEachElement([&](const Node& node) { reader.readDevice(node); });
    reader.expectSoundChains();
    motions.settle();
}

}  // namespace simulator
