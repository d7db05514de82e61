#pragma once

#include <optional>
#include <string_view>
#include <vector>

#include "sessions/ReadValue.h"
#include "sessions/Simulator.h"

namespace simulator {

// Reads and writes properties for one session. `type` is the data type in the name of the
// driver's function; it must be the property's. A scalar property of several resources is read and
// written as an array of its type, one element for each resource. Needs the simulator's mutex to
// be held.
class PropertyAccessor {
  public:
    PropertyAccessor(Simulator& simulator, Session& session)
        : simulator(simulator), session(session) {}

    // category: that of the system or of the session.
    ReadValue readIn(Category category, std::string_view name, DataType type);
    // A name that is the session's is read there, whatever the resources are.
    ReadValue read(std::string_view resources, std::string_view name, DataType type);

    // Write all values or none. What needs a commit waits for it.
    void writeIn(Category category, std::string_view name, DataType type, const Elements& values);
    void write(std::string_view resources, std::string_view name, DataType type,
               const Elements& values);

    // Makes what waits for a commit take effect on resources, and on all parts of devices.
    void commit(std::string_view resources);

    // Open a property to read its attributes.
    OpenProperty openDriverDefined(std::string_view name);
    OpenProperty openGeneric(std::string_view resource, std::string_view name);

  private:
    // A property of the system, the session or one resource.
    struct Place {
        // Null for the system and the session.
        Resource* resource;
        const PropertyDefinition* definition;
        // Null for a computed property.
        Property* stored;
        std::optional<ReadValue> computed;
    };

    // The names of the properties that there are.
    std::vector<std::string> knownNames(Category category, const Resource* resource,
                                        const PropertyStore& store) const;
    bool isOfSession(const HashedName& name) const;
    Place findIn(Category category, const HashedName& name);
    Place findOn(Resource& resource, const HashedName& name);
    Place find(Category category, Resource* resource, PropertyStore& store, const HashedName& name);
    std::vector<Place> findAll(std::string_view resources, const HashedName& name);
    ReadValue readOne(Place place, DataType type, std::size_t places = 1);
    Elements readAll(std::vector<Place> places, DataType type);
    void writeAll(const std::vector<Place>& places, DataType type, const Elements& values);
    // Null for the system and the session.
    void noteChange(const Resource* resource) noexcept;
    void expectAcceptable(const Place& place, const Elements& value) const;

    Simulator& simulator;
    Session& session;
};

}  // namespace simulator
