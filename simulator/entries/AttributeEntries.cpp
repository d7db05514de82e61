// The attributes of properties.

#include "entries/Attributes.h"
#include "entries/ValueFunctions.h"
#include "sessions/PropertyAccessor.h"

using namespace simulator;

namespace {

OpenProperty openProperty(Simulator& simulator, nQITRMCAPI100_Property handle) {
    const auto found = simulator.openProperties.find(handle);
    if (!found) {
        throw Refusal(code::unknownHandle).usage(tag::handle, handle);
    }
    return *found;
}

struct PropertyAttribute {
    nQITRMCAPI100_Property handle;
    const char* name;

    Call describe(const char* function) const {
        return Call(function).in("handle", handle).in("attribute", name);
    }
    ReadValue read(Simulator& simulator, DataType type) const {
        const OpenProperty property = openProperty(simulator, handle);
        return ReadValue(attribute(simulator, property, required(name, "attribute"), type));
    }
};

}  // namespace

void nQITRMCAPI100_openDriverDefinedProperty(nQITRMCAPI100_Session session, const char* property,
                                             nQITRMCAPI100_Property* handle, qierr_Status* status) {
    clearOutputs(status, handle);
    const auto call = [&, function = __func__] {
        return Call(function).session(session).in("property", property).out("handle", handle);
    };
    withSharedSession(session, status, call, [&](Simulator& simulator, Session& owner) {
        *handle = simulator.openProperties.add(
            PropertyAccessor(simulator, owner).openDriverDefined(required(property, "property")));
    });
}

void nQITRMCAPI100_openGenericProperty(nQITRMCAPI100_Session session, const char* resource,
                                       const char* property, nQITRMCAPI100_Property* handle,
                                       qierr_Status* status) {
    clearOutputs(status, handle);
    const auto call = [&, function = __func__] {
        return Call(function)
            .session(session)
            .resources("resource", resource)
            .in("property", property)
            .out("handle", handle);
    };
    withSharedSession(session, status, call, [&](Simulator& simulator, Session& owner) {
        *handle = simulator.openProperties.add(
            PropertyAccessor(simulator, owner)
                .openGeneric(required(resource, "resource"), required(property, "property")));
    });
}

void nQITRMCAPI100_closeProperty(nQITRMCAPI100_Property handle, qierr_Status* status) {
    const auto call = [&, function = __func__] { return Call(function).in("handle", handle); };
    withSharedSimulator(status, call, [&](Simulator& simulator) {
        if (!simulator.openProperties.remove(handle)) {
            throw Refusal(code::unknownHandle).usage(tag::handle, handle);
        }
    });
}

void nQITRMCAPI100_getPropertyPropertyInt32(nQITRMCAPI100_Property handle, const char* attribute,
                                            std::int32_t* value, qierr_Status* status) {
    getScalar(__func__, PropertyAttribute{handle, attribute}, value, status);
}

void nQITRMCAPI100_getPropertyPropertyBool(nQITRMCAPI100_Property handle, const char* attribute,
                                           std::uint8_t* value, qierr_Status* status) {
    getScalar(__func__, PropertyAttribute{handle, attribute}, value, status);
}

void nQITRMCAPI100_getPropertyPropertyString(nQITRMCAPI100_Property handle, const char* attribute,
                                             char** value, qierr_Status* status) {
    getScalar(__func__, PropertyAttribute{handle, attribute}, value, status);
}

void nQITRMCAPI100_getPropertyPropertyInt32Array(nQITRMCAPI100_Property handle,
                                                 const char* attribute, std::int32_t** array,
                                                 std::uint32_t* count, qierr_Status* status) {
    getArray(__func__, PropertyAttribute{handle, attribute}, array, count, status);
}

void nQITRMCAPI100_getPropertyPropertyStringArray(nQITRMCAPI100_Property handle,
                                                  const char* attribute, char*** array,
                                                  std::uint32_t* count, qierr_Status* status) {
    getArray(__func__, PropertyAttribute{handle, attribute}, array, count, status);
}
