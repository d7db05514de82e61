#include "qitrmcwebsvc/SessionProperty.h"

#include <algorithm>
#include <utility>

#include "qitrmcsharedcmn/parseUtilities.h"
#include "qitrmcwebsvc/callDriver.h"
#include "qitrmcwebsvc/invalidParams.h"
#include "qitrmcwebsvc/resourceTokens.h"

namespace nQITRMCWEBSVC100 {

using namespace nQITRMCSHAREDCMN100;

namespace {

// The numbers of the data types: the scalar types, followed by their array types in the same order.
constexpr std::int32_t firstScalarType = 1;
constexpr std::int32_t scalarTypeCount = 7;

PropertyCategory categoryOf(ResourceKind kind) {
    switch (kind) {
        case ResourceKind::Device:
            return PropertyCategory::Device;
        case ResourceKind::PhysicalChannel:
            return PropertyCategory::PhysChan;
        case ResourceKind::NvmemArea:
            return PropertyCategory::NvmemArea;
        case ResourceKind::None:
            throwInvalidParams("MustSpecifyOneOfDevicesNvmemsPhyChannels", QITRMC_HERE);
    }
    throw InternalError("Unsupported resource type", QITRMC_HERE);
}

}  // namespace

SessionProperty::SessionProperty(std::shared_ptr<SessionContext> session, std::string name,
                                 const RequestResource& resources)
    : session(std::move(session)), name(std::move(name)) {
    decideCategory(resources.kind());
    this->resources = resources.names();
    if (isOnResources()) {
        expandTokens();
    }
    joinedResources = compressNames(this->resources, NameKind::Path);
    open();
    type = metaInt32("Prop.DataType");
    spreadOverResources();
}

bool SessionProperty::isScalar() const {
    return type >= firstScalarType && type < firstScalarType + scalarTypeCount;
}

bool SessionProperty::isArray() const {
    return type >= firstScalarType + scalarTypeCount &&
           type < firstScalarType + 2 * scalarTypeCount;
}

std::int32_t SessionProperty::metaInt32(const char* attribute) const {
    std::int32_t value = 0;
    callDriver(nQITRMCAPI100_getPropertyPropertyInt32, handle.get(), attribute, &value);
    return value;
}

bool SessionProperty::metaBool(const char* attribute) const {
    std::uint8_t value = 0;
    callDriver(nQITRMCAPI100_getPropertyPropertyBool, handle.get(), attribute, &value);
    return value != 0;
}

std::string SessionProperty::metaString(const char* attribute) const {
    DriverString value;
    callDriver(nQITRMCAPI100_getPropertyPropertyString, handle.get(), attribute, value.out());
    return value.copy();
}

std::vector<std::int32_t> SessionProperty::metaInt32Array(const char* attribute) const {
    DriverArray<std::int32_t> values;
    callDriver(nQITRMCAPI100_getPropertyPropertyInt32Array, handle.get(), attribute,
               values.outArray(), values.outCount());
    return std::vector<std::int32_t>(values.begin(), values.end());
}

std::vector<std::string> SessionProperty::metaStringArray(const char* attribute) const {
    DriverStringArray values;
    callDriver(nQITRMCAPI100_getPropertyPropertyStringArray, handle.get(), attribute,
               values.outArray(), values.outCount());
    return std::vector<std::string>(values.begin(), values.end());
}

// The driver's lists are read each time, since they may change.
void SessionProperty::decideCategory(ResourceKind kind) {
    for (const PropertyCategory candidate : {PropertyCategory::Session, PropertyCategory::System}) {
        if (isPropertyName(session->driverSession, candidate, name)) {
            propertyCategory = candidate;
            driverDefined = true;
            return;
        }
    }
    propertyCategory = categoryOf(kind);
    driverDefined = isPropertyName(session->driverSession, propertyCategory, name);
}

bool SessionProperty::isOnResources() const {
    return propertyCategory != PropertyCategory::System &&
           propertyCategory != PropertyCategory::Session;
}

// The driver would accept tokens, but the number of resources must be known.
void SessionProperty::expandTokens() {
    const auto isName = [](const std::string& resource) {
        return !resource.empty() && propertyOfToken(resource) == nullptr;
    };
    if (std::all_of(resources.begin(), resources.end(), isName)) {
        return;
    }
    std::vector<std::string> expanded;
    for (std::string& resource : resources) {
        if (resource.empty()) {
            continue;
        }
        const char* property = propertyOfToken(resource);
        if (property == nullptr) {
            expanded.push_back(std::move(resource));
            continue;
        }
        DriverStringArray content;
        callDriver(nQITRMCAPI100_getSessionPropertyStringArray, session->driverSession, property,
                   content.outArray(), content.outCount());
        expanded.insert(expanded.end(), content.begin(), content.end());
    }
    resources = std::move(expanded);
}

void SessionProperty::open() {
    if (driverDefined) {
        callDriver(nQITRMCAPI100_openDriverDefinedProperty, session->driverSession, name.c_str(),
                   handle.out());
    } else {
        callDriver(nQITRMCAPI100_openGenericProperty, session->driverSession,
                   resources.empty() ? "" : resources.front().c_str(), name.c_str(), handle.out());
    }
}

void SessionProperty::spreadOverResources() {
    if (!isOnResources() || resources.size() < 2) {
        return;
    }
    if (isArray()) {
        BasicError error(qierr::codes::arrayOnSeveralResources, QITRMC_HERE);
        addUsageString(error.details(), "kUsageTypeDevices", joinedResources.c_str());
        throw error;
    }
    if (isScalar()) {
        type += scalarTypeCount;
    }
}

}  // namespace nQITRMCWEBSVC100
