#include "description/RegisterReader.h"

#include <algorithm>

#include "Members.h"
#include "description/Nearest.h"
#include "description/PartsReader.h"
#include "model/RegisterValues.h"

namespace simulator {

namespace {

void readAccess(const Node& node, RegisterBlock& block) {
    node.ifPresent("access", [&](const Node& access) {
        const std::string name = access.text();
        block.readable = name != "WriteOnly";
        block.writable = name != "ReadOnly";
        if (name != "ReadWrite" && block.readable && block.writable) {
            access.fail("is " + access.shown(),
                        perhapsMeant(name, {"ReadOnly", "WriteOnly", "ReadWrite"}) +
                            "must be ReadOnly, WriteOnly or ReadWrite");
        }
    });
}

void readWidth(const Node& node, RegisterBlock& block) {
    node.ifPresent("width", [&](const Node& width) {
        const std::uint32_t bits = width.unsignedNumber(8, 64);
        width.expect(bits == 8 || bits == 16 || bits == 32 || bits == 64, "8, 16, 32 or 64");
        block.width = bits / 8;
        if (block.address % block.width != 0 || block.size() % block.width != 0) {
            width.fail("does not divide the block",
                       "address and size must be multiples of the width in bytes");
        }
    });
}

// A member whose text is one certain word.
bool readWord(const Node& node, const char* member, const char* word) {
    if (!node.has(member)) {
        return false;
    }
    const Node text = node.member(member, "");
    text.expect(text.text() == word, word);
    return true;
}

void readActions(const Node& node, Device& device, RegisterBlock& block) {
    block.clearsOnRead = readWord(node, "on_read", "clear");
    block.onesClear = readWord(node, "on_write", "ones_clear");
    if (block.clearsOnRead && !block.readable) {
        node.member("on_read", "").fail("never happens", "the registers cannot be read");
    }
    if (block.onesClear && !block.writable) {
        node.member("on_write", "").fail("never happens", "the registers cannot be written");
    }
    node.ifPresent("runs", [&](const Node& name) {
        block.command = name.text();
        if (device.command(block.command) == nullptr) {
            name.fail("is not a command of the device", "a write carries out such a command");
        }
        if (!block.writable) {
            name.fail("never happens", "the registers cannot be written");
        }
    });
}

Resource& readOwner(const Node& node, const Chassis& chassis, Device& device) {
    if (!node.has("resource")) {
        return device;
    }
    const Node name = node.member("resource", "");
    Resource* part = chassis.findPart(device, name.text());
    if (part == nullptr) {
        name.fail("is not a part of the device", "must be a channel or an area, like ch0");
    }
    return *part;
}

std::string sizesText(const std::vector<std::uint32_t>& sizes) {
    std::string text = std::to_string(sizes.front());
    for (std::size_t i = 1; i < sizes.size(); ++i) {
        text += (i + 1 < sizes.size() ? ", " : " or ") + std::to_string(sizes[i]);
    }
    return text;
}

void readProperty(const Node& node, Resource& owner, RegisterBlock& block) {
    const std::string name = node.text();
    block.owner = &owner;
    block.property = owner.properties.find(name);
    if (block.property == nullptr) {
        node.fail("is not a stored property of the resource",
                  perhapsMeant(name, owner.properties.names()) +
                      "a register shows a property that is there");
    }
    const PropertyDefinition& definition = *block.property->definition;
    if (block.readable && definition.access == PropertyAccess::WriteOnly) {
        node.fail("can only be written", "the access of the registers must be WriteOnly");
    }
    const auto sizes = registerSizes(definition.type);
    if (sizes.empty()) {
        node.fail("cannot be shown", "only single numbers and Booleans can");
    }
    if (std::find(sizes.begin(), sizes.end(), block.size()) == sizes.end()) {
        node.fail("does not have the size of the registers",
                  "its size can be " + sizesText(sizes) + " bytes");
    }
}

// A block that shows a property has no content of its own.
void expectNothingElse(const Node& node) {
    for (const char* const member : {"bytes", "on_read", "on_write", "runs"}) {
        node.ifPresent(member, [](const Node& other) {
            other.fail("contradicts shows", "registers that show a property do nothing else");
        });
    }
}

void readShown(const Node& node, const Chassis& chassis, Device& device, RegisterBlock& block) {
    if (node.json().IsString()) {
        readProperty(node, device, block);
        return;
    }
    node.expect(node.json().IsObject(), "a text, or an object with property and resource");
    node.expectMembers(members::shown);
    Resource& owner = readOwner(node, chassis, device);
    readProperty(node.member("property", "the name of the property"), owner, block);
}

}  // namespace

void readRegisterBlock(const Node& node, const Chassis& chassis, Device& device) {
    node.expectMembers(members::registerBlock);
    RegisterBlock block;
    node.ifPresent("name", [&](const Node& name) {
        block.name = name.text();
        if (block.name.empty()) {
            name.fail("is empty", "must be what people call the registers");
        }
    });
    node.ifPresent("description", [&](const Node& text) { block.description = text.text(); });
    block.address = node.member("address", "the first address").unsignedNumber(0, UINT32_MAX);
    block.initial = readBytes(node);
    block.bytes = block.initial;
    readAccess(node, block);
    readWidth(node, block);
    readActions(node, device, block);
    node.ifPresent("shows", [&](const Node& shown) {
        expectNothingElse(node);
        readShown(shown, chassis, device, block);
    });
    const std::uint64_t last = std::uint64_t{block.address} + block.size() - 1;
    const std::string addresses = std::to_string(block.address) + " to " + std::to_string(last);
    if (!device.registers.add(std::move(block))) {
        node.fail(
            "has the addresses " + addresses + ", which overlap other registers or pass 4294967295",
            "each address may stand for one register");
    }
}

}  // namespace simulator
