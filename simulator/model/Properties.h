#pragma once

#include <array>
#include <map>
#include <memory>
#include <optional>
#include <set>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "Api.h"
#include "lending/SharedTexts.h"
#include "model/NameIndex.h"
#include "model/Values.h"

namespace simulator {

// What kinds of things have properties.
enum class Category { System, Session, Device, PhysChan, NvmemArea };
inline constexpr std::size_t categoryCount = 5;

// The numbers of the enumeration "PropertyAccess".
enum class PropertyAccess : std::int32_t { ReadOnly = 1, WriteOnly = 2, ReadWrite = 3 };

struct Enumeration {
    std::string name;
    // By which the details of a status refer to the enumeration.
    std::uint32_t id = 0;
    // In the order of the description.
    std::vector<std::pair<std::string, std::int32_t>> items;

    // Adds an item. The name must be free.
    void add(const std::string& item, std::int32_t number);
    bool has(std::int32_t value) const { return numbers.count(value) != 0; }
    // Returns nothing when there is no such item.
    std::optional<std::int32_t> numberOf(std::string_view item) const;

  private:
    std::map<std::string, std::int32_t, std::less<>> byName;
    std::set<std::int32_t> numbers;
};

// By their names.
using Enumerations = std::map<std::string, std::shared_ptr<const Enumeration>>;

// Everything about a property but its value.
struct PropertyDefinition {
    std::string name;
    DataType type = DataType::Text;
    PropertyAccess access = PropertyAccess::ReadOnly;
    // Kept by the simulator itself, not stored as a value.
    bool computed = false;
    // Written values take effect at a commit.
    bool needsCommit = false;
    // The value outlasts resets and restarts; of a property that needs a commit, the committed one.
    bool lasting = false;
    std::string description;
    std::string document;
    std::string unit;
    // Limits of each element, one element each.
    std::optional<Elements> least;
    std::optional<Elements> most;
    std::shared_ptr<const Enumeration> enumeration;
    std::optional<Elements> initial;

    // Brings each number between the limits, and what is infinite to the largest number there is.
    void limit(Elements& value) const;
    // The index of the first element outside of the limits, or that is no item of the enumeration.
    // The elements are of the property's type.
    std::optional<std::size_t> firstOutOfRange(const Elements& value) const;
    std::optional<std::size_t> firstWithoutItem(const Elements& value) const;
};

using DefinitionPointer = std::shared_ptr<const PropertyDefinition>;

// A property with its value.
struct Property {
    struct Pending {
        Elements value;
        nQITRMCAPI100_Session session;
    };

    DefinitionPointer definition;
    // The value after power-on, unless the property is a lasting one.
    Elements initial;
    Elements value;
    std::optional<Pending> pending;
};

// The stored properties of one thing. Names are compared byte by byte.
class PropertyStore {
  public:
    PropertyStore() = default;
    PropertyStore(const PropertyStore& other);
    PropertyStore(PropertyStore&&) = default;
    PropertyStore& operator=(PropertyStore other) noexcept;

    // Adds a property with its value after power-on. A name that is there keeps its property.
    void add(const DefinitionPointer& definition, const Elements& initial);
    // Adds a property that the driver does not define itself.
    void addOwn(const DefinitionPointer& definition);

    // Return null when there is no such property.
    Property* find(const HashedName& name) { return findIn(byName, name); }
    const Property* find(const HashedName& name) const { return findIn(byName, name); }
    Property* find(std::string_view name) { return find(HashedName(name)); }
    const Property* find(std::string_view name) const { return find(HashedName(name)); }

    // The names of all properties, sorted.
    std::vector<std::string> names() const;
    // The names of the properties that the driver does not define, in the order of addition.
    const Elements& ownNames() const { return own; }

    // Calls visit(Property&) for each property.
    template <typename Visit>
    void forEach(Visit visit) {
        for (auto& [name, property] : all) {
            visit(property);
        }
    }
    void commit();
    // Discards what a session wrote and did not commit.
    void dropPending(nQITRMCAPI100_Session session);
    void dropAllPending() noexcept;

  private:
    // In the order of their names, and to be found by name. The names are those in `all`.
    std::map<std::string, Property, std::less<>> all;
    NameIndex<Property*> byName;
    Elements own = List<std::string>();
};

// The properties that the driver itself defines.
class Catalogue {
  public:
    void add(Category category, const DefinitionPointer& definition);

    const std::vector<DefinitionPointer>& definitions(Category category) const {
        return part(category).definitions;
    }
    // The names of the definitions.
    const SharedTexts& names(Category category) const;
    // Null when there is no such property.
    const DefinitionPointer& find(Category category, const HashedName& name) const;
    const DefinitionPointer& find(Category category, std::string_view name) const {
        return find(category, HashedName(name));
    }

  private:
    struct Part {
        // In the order of addition, and to be found by name.
        std::vector<DefinitionPointer> definitions;
        TextsOnDemand names;
        NameIndex<DefinitionPointer> byName;
    };

    const Part& part(Category category) const { return parts[static_cast<std::size_t>(category)]; }

    std::array<Part, categoryCount> parts;
};

}  // namespace simulator
