// The properties of devices, physical channels and NVMEM areas.

#include "entries/TypedValues.h"
#include "sessions/PropertyDesk.h"

using namespace simulator;

namespace {

Call propertyCall(const char* function, nQITRMCAPI100_Session session, const char* resources,
                  const char* property) {
    return Call(function)
        .session(session)
        .resources("resources", resources)
        .in("property", property);
}

template <typename Value>
void getScalar(const char* function, nQITRMCAPI100_Session session, const char* resources,
               const char* property, DataType type, Value* value, qierr_Status* status) {
    clearOutputs(status, value);
    const auto call = [&] {
        return propertyCall(function, session, resources, property).out("value", value);
    };
    withSession(session, status, call, [&](Simulator& simulator, Session& owner) {
        PropertyDesk desk(simulator, owner);
        lendScalar(
            desk.read(required(resources, "resources"), required(property, "property"), type),
            value);
    });
}

template <typename Value>
void getArray(const char* function, nQITRMCAPI100_Session session, const char* resources,
              const char* property, DataType type, Value** array, uint32_t* count,
              qierr_Status* status) {
    clearOutputs(status, array, count);
    const auto call = [&] {
        return propertyCall(function, session, resources, property).out("array", array, count);
    };
    withSession(session, status, call, [&](Simulator& simulator, Session& owner) {
        PropertyDesk desk(simulator, owner);
        lendArray(desk.read(required(resources, "resources"), required(property, "property"), type),
                  array, count);
    });
}

template <typename Value>
void setScalar(const char* function, nQITRMCAPI100_Session session, const char* resources,
               const char* property, DataType type, Value value, qierr_Status* status) {
    const auto call = [&] {
        return propertyCall(function, session, resources, property).in("value", value);
    };
    withSession(session, status, call, [&](Simulator& simulator, Session& owner) {
        PropertyDesk(simulator, owner)
            .write(required(resources, "resources"), required(property, "property"), type,
                   asElements(value));
    });
}

template <typename Value>
void setArray(const char* function, nQITRMCAPI100_Session session, const char* resources,
              const char* property, DataType type, const Value* array, uint32_t count,
              qierr_Status* status) {
    const auto call = [&] {
        return propertyCall(function, session, resources, property).in("array", array, count);
    };
    withSession(session, status, call, [&](Simulator& simulator, Session& owner) {
        PropertyDesk(simulator, owner)
            .write(required(resources, "resources"), required(property, "property"), type,
                   asElements(array, count));
    });
}

}  // namespace

// The four functions of one type. Given and Taken are the C types of a value that comes out and
// of one that goes in.
#define GENERIC_PROPERTY_FUNCTIONS(Name, Given, Taken, type)                                       \
    void nQITRMCAPI100_getGenericProperty##Name(nQITRMCAPI100_Session session,                     \
                                                const char* resources, const char* property,       \
                                                Given* value, qierr_Status* status) {              \
        getScalar(__func__, session, resources, property, DataType::type, value, status);          \
    }                                                                                              \
    void nQITRMCAPI100_getGenericProperty##Name##Array(                                            \
        nQITRMCAPI100_Session session, const char* resources, const char* property, Given** array, \
        uint32_t* count, qierr_Status* status) {                                                   \
        getArray(__func__, session, resources, property, DataType::type##Array, array, count,      \
                 status);                                                                          \
    }                                                                                              \
    void nQITRMCAPI100_setGenericProperty##Name(nQITRMCAPI100_Session session,                     \
                                                const char* resources, const char* property,       \
                                                Taken value, qierr_Status* status) {               \
        setScalar(__func__, session, resources, property, DataType::type, value, status);          \
    }                                                                                              \
    void nQITRMCAPI100_setGenericProperty##Name##Array(                                            \
        nQITRMCAPI100_Session session, const char* resources, const char* property,                \
        Taken const* array, uint32_t count, qierr_Status* status) {                                \
        setArray(__func__, session, resources, property, DataType::type##Array, array, count,      \
                 status);                                                                          \
    }

GENERIC_PROPERTY_FUNCTIONS(Bool, uint8_t, uint8_t, boolean)
GENERIC_PROPERTY_FUNCTIONS(Double, double, double, real)
GENERIC_PROPERTY_FUNCTIONS(Int32, int32_t, int32_t, int32)
GENERIC_PROPERTY_FUNCTIONS(Int64, int64_t, int64_t, int64)
GENERIC_PROPERTY_FUNCTIONS(String, char*, const char*, text)
GENERIC_PROPERTY_FUNCTIONS(UInt32, uint32_t, uint32_t, uint32)
GENERIC_PROPERTY_FUNCTIONS(UInt64, uint64_t, uint64_t, uint64)

#undef GENERIC_PROPERTY_FUNCTIONS

void nQITRMCAPI100_commitPropertiesGeneric(nQITRMCAPI100_Session session, const char* resources,
                                           qierr_Status* status) {
    const auto call = [&, function = __func__] {
        return Call(function).session(session).resources("resources", resources);
    };
    withSession(session, status, call, [&](Simulator& simulator, Session& owner) {
        PropertyDesk(simulator, owner).commit(required(resources, "resources"));
    });
}

void nQITRMCAPI100_getDevicePropertyString(nQITRMCAPI100_Session session, const char* device,
                                           const char* property, char** value,
                                           qierr_Status* status) {
    clearOutputs(status, value);
    const auto call = [&, function = __func__] {
        return Call(function)
            .session(session)
            .resources("device", device, "$DefaultDevices")
            .in("property", property)
            .out("value", value);
    };
    withSession(session, status, call, [&](Simulator& simulator, Session& owner) {
        const char* resource = device != nullptr ? device : "$DefaultDevices";
        const Device& found = simulator.resolver(owner).oneDevice(resource);
        PropertyDesk desk(simulator, owner);
        lendScalar(desk.read(found.name, required(property, "property"), DataType::text), value);
    });
}
