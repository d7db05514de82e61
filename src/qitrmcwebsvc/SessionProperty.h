#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "qitrmcwebsvc/DriverOwners.h"
#include "qitrmcwebsvc/RequestResource.h"
#include "qitrmcwebsvc/SessionContext.h"
#include "qitrmcwebsvc/propertyNames.h"

namespace nQITRMCWEBSVC100 {

// One property of the system, of a session or of resources. It is open in the driver during the
// lifetime of the object. Used by one thread.
//
// All operations throw qierr::Exception with the driver's status if a driver call fails.
class SessionProperty {
  public:
    // Determines the category of the property, opens it and reads its data type. If the session or
    // the system has a property of this name, that property is used and the resources are ignored;
    // otherwise the property belongs to the resources.
    //
    // The type of a scalar property on several resources is the array of its type, with one element
    // for each resource in their order.
    //
    // Throws BasicError invalidParams if the property needs resources and there are none, and
    // arrayOnSeveralResources for an array property on several resources; InternalError for an
    // unknown kind of resources.
    SessionProperty(std::shared_ptr<SessionContext> session, std::string name,
                    const RequestResource& resources);

    PropertyCategory category() const { return propertyCategory; }
    // Whether the driver's list for the category contains the name.
    bool isDriverDefined() const { return driverDefined; }
    // A number of propertyTypes.def, or an unknown number from the driver.
    std::int32_t dataType() const { return type; }
    bool isScalar() const;
    bool isArray() const;

    // getBool, setBool and so on for each type. Throws InternalError for the types of system and
    // session properties for which the driver has no function.
#define QITRMC_PROPERTY_TYPE(number, Type, Value) \
    Value get##Type() const;                      \
    void set##Type(const Value& value);
#include "qitrmcwebsvc/propertyTypes.def"

    // Attributes of the property itself, such as "Prop.Access".
    std::int32_t metaInt32(const char* attribute) const;
    bool metaBool(const char* attribute) const;
    std::string metaString(const char* attribute) const;
    std::vector<std::int32_t> metaInt32Array(const char* attribute) const;
    std::vector<std::string> metaStringArray(const char* attribute) const;

  private:
    void decideCategory(ResourceKind kind);
    bool isOnResources() const;
    void expandTokens();
    void open();
    void spreadOverResources();

    template <typename... Values>
    struct Functions;
    template <typename... Values>
    auto choose(const Functions<Values...>& functions) const;
    template <typename Number>
    Number readNumber(const Functions<Number*>& functions) const;
    template <typename Number>
    std::vector<Number> readNumbers(const Functions<Number**, std::uint32_t*>& functions) const;
    template <typename Number>
    void writeNumbers(const Functions<const Number*, std::uint32_t>& functions,
                      const std::vector<Number>& values) const;

    std::shared_ptr<SessionContext> session;
    std::string name;
    PropertyCategory propertyCategory;
    std::vector<std::string> resources;
    std::string joinedResources;
    bool driverDefined;
    DriverProperty handle;
    std::int32_t type;
};

}  // namespace nQITRMCWEBSVC100
