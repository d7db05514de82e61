// The properties of devices, physical channels and NVMEM areas.

#include "entries/TypedValues.h"
#include "sessions/PropertyDesk.h"

using namespace simulator;

namespace {

template <typename Value>
void getScalar(nQITRMCAPI100_Session session, const char* resources, const char* property,
               DataType type, Value* value, qierr_Status* status) {
    clearOutputs(status, value);
    withSession(session, status, [&](Simulator& simulator, Session& owner) {
        PropertyDesk desk(simulator, owner);
        lendScalar(
            desk.read(required(resources, "resources"), required(property, "property"), type),
            value);
    });
}

template <typename Value>
void getArray(nQITRMCAPI100_Session session, const char* resources, const char* property,
              DataType type, Value** array, uint32_t* count, qierr_Status* status) {
    clearOutputs(status, array, count);
    withSession(session, status, [&](Simulator& simulator, Session& owner) {
        PropertyDesk desk(simulator, owner);
        lendArray(desk.read(required(resources, "resources"), required(property, "property"), type),
                  array, count);
    });
}

template <typename Value>
void setScalar(nQITRMCAPI100_Session session, const char* resources, const char* property,
               DataType type, Value value, qierr_Status* status) {
    withSession(session, status, [&](Simulator& simulator, Session& owner) {
        PropertyDesk(simulator, owner)
            .write(required(resources, "resources"), required(property, "property"), type,
                   asElements(value));
    });
}

template <typename Value>
void setArray(nQITRMCAPI100_Session session, const char* resources, const char* property,
              DataType type, const Value* array, uint32_t count, qierr_Status* status) {
    withSession(session, status, [&](Simulator& simulator, Session& owner) {
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
        getScalar(session, resources, property, DataType::type, value, status);                    \
    }                                                                                              \
    void nQITRMCAPI100_getGenericProperty##Name##Array(                                            \
        nQITRMCAPI100_Session session, const char* resources, const char* property, Given** array, \
        uint32_t* count, qierr_Status* status) {                                                   \
        getArray(session, resources, property, DataType::type##Array, array, count, status);       \
    }                                                                                              \
    void nQITRMCAPI100_setGenericProperty##Name(nQITRMCAPI100_Session session,                     \
                                                const char* resources, const char* property,       \
                                                Taken value, qierr_Status* status) {               \
        setScalar(session, resources, property, DataType::type, value, status);                    \
    }                                                                                              \
    void nQITRMCAPI100_setGenericProperty##Name##Array(                                            \
        nQITRMCAPI100_Session session, const char* resources, const char* property,                \
        Taken const* array, uint32_t count, qierr_Status* status) {                                \
        setArray(session, resources, property, DataType::type##Array, array, count, status);       \
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
    withSession(session, status, [&](Simulator& simulator, Session& owner) {
        PropertyDesk(simulator, owner).commit(required(resources, "resources"));
    });
}

void nQITRMCAPI100_getDevicePropertyString(nQITRMCAPI100_Session session, const char* device,
                                           const char* property, char** value,
                                           qierr_Status* status) {
    clearOutputs(status, value);
    withSession(session, status, [&](Simulator& simulator, Session& owner) {
        const char* resource = device != nullptr ? device : "$DefaultDevices";
        const Device& found = simulator.resolver(owner).oneDevice(resource);
        PropertyDesk desk(simulator, owner);
        lendScalar(desk.read(found.name, required(property, "property"), DataType::text), value);
    });
}
