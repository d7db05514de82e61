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

// One property of the system, of a session or of resources, open in the driver for the object's
// life. Used by one thread.
//
// All operations throw qierr::Exception with the driver's status when the driver refuses.
class SessionProperty {
  public:
    // Finds out what the property belongs to, opens it and learns its data type. A name of the
    // session's or the system's properties is theirs, whatever resources come with it; any other
    // name is a property of the resources.
    //
    // A scalar property on several resources has the array of its type, one element for each
    // resource in their order.
    //
    // Throws BasicError invalidParams when the name needs resources and there are none, and
    // arrayOnSeveralResources when an array property is asked of several resources; InternalError
    // for a kind of resources that does not exist.
    SessionProperty(std::shared_ptr<SessionContext> session, std::string name,
                    const RequestResource& resources);

    PropertyCategory category() const { return propertyCategory; }
    // Whether the name stands in the driver's list for the category.
    bool isDriverDefined() const { return driverDefined; }
    // A number of propertyTypes.def, or what else the driver gave.
    std::int32_t dataType() const { return type; }
    bool isScalar() const;
    bool isArray() const;

    // getBool, setBool and so on for each type. The driver has no function for some types of system
    // and session properties: InternalError.
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
