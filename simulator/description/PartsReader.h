#pragma once

#include "description/Description.h"
#include "description/PropertyReader.h"
#include "model/Chassis.h"

namespace simulator {

// Read what belongs to one device. `enumerations` are those of the whole description. All of them
// throw DescriptionError.

// The values, properties and commands of a resource, from the members of `node`.
void readResource(const Node& node, Category category, const Chassis& chassis,
                  const Enumerations& enumerations, Resource& resource);
void readPhysChans(const Node& node, const Enumerations& enumerations, Chassis& chassis,
                   Device& device);
void readNvmemArea(const Node& node, const Enumerations& enumerations, Chassis& chassis,
                   Device& device);

// Reads the members "size" and "bytes": so many bytes, the first of them given in hexadecimal
// digits and the others 0.
std::vector<std::uint8_t> readBytes(const Node& node);
// Reads a text that can serve as a name; `errorOf` says why not.
std::string readName(const Node& node, std::string (*errorOf)(std::string_view));

}  // namespace simulator
