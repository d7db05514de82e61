#pragma once

#include <string>

#include "description/Description.h"
#include "model/Properties.h"

namespace simulator {

// Reads the enumerations of a description: an object of objects of item name to number.
Enumerations readEnumerations(const Node& node);

// Reads one definition. The property needs a value only where it is to be stored on its own.
PropertyDefinition readDefinition(const std::string& name, const Node& node,
                                  const Enumerations& enumerations);

// Makes sure that clients can write the name of a property, a command or the like.
void expectWritableName(const std::string& name, const Node& node);

// Who defines a property. What is computed can come from the driver alone.
enum class Origin { Driver, File };

// Adds the driver-defined properties of an object of categories to a catalogue.
void readCatalogue(const Node& node, const Enumerations& enumerations, Origin origin,
                   Catalogue& catalogue);

// Fills a store with the driver-defined properties of a category that have a value: one from
// `values`, which may be null, or the initial one of the definition.
void fillStore(Category category, const Catalogue& catalogue, const Node* values,
               PropertyStore& store);

// Adds the properties of an object of definitions, none of which the driver defines itself.
void addOwnProperties(const Node& node, Category category, const Catalogue& catalogue,
                      const Enumerations& enumerations, PropertyStore& store);

}  // namespace simulator
