// The properties of devices, physical channels and NVMEM areas.

#include "entries/ValueFunctions.h"
#include "sessions/PropertyAccessor.h"

using namespace simulator;

namespace {

struct ResourceProperty {
    nQITRMCAPI100_Session session;
    const char* resources;
    const char* name;

    Call describe(const char* function) const {
        return Call(function)
            .session(session)
            .resources("resources", resources)
            .in("property", name);
    }
    ReadValue read(Simulator& simulator, DataType type) const {
        return PropertyAccessor(simulator, simulator.sessions.get(session))
            .read(required(resources, "resources"), required(name, "property"), type);
    }
    void write(Simulator& simulator, DataType type, const Elements& values) const {
        PropertyAccessor(simulator, simulator.sessions.get(session))
            .write(required(resources, "resources"), required(name, "property"), type, values);
    }
};

struct DeviceProperty {
    nQITRMCAPI100_Session session;
    const char* device;
    const char* name;

    Call describe(const char* function) const {
        return Call(function)
            .session(session)
            .resources("device", device, "$DefaultDevices")
            .in("property", name);
    }
    ReadValue read(Simulator& simulator, DataType type) const {
        Session& owner = simulator.sessions.get(session);
        const Device& found =
            simulator.resolver(owner).oneDevice(device != nullptr ? device : "$DefaultDevices");
        return PropertyAccessor(simulator, owner)
            .read(found.name, required(name, "property"), type);
    }
};

}  // namespace

// The four functions of one type. Read and Written are its C types.
#define GENERIC_PROPERTY_FUNCTIONS(Name, Read, Written)                                           \
    void nQITRMCAPI100_getGenericProperty##Name(nQITRMCAPI100_Session session,                    \
                                                const char* resources, const char* property,      \
                                                Read* value, qierr_Status* status) {              \
        getScalar(__func__, ResourceProperty{session, resources, property}, value, status);       \
    }                                                                                             \
    void nQITRMCAPI100_getGenericProperty##Name##Array(                                           \
        nQITRMCAPI100_Session session, const char* resources, const char* property, Read** array, \
        std::uint32_t* count, qierr_Status* status) {                                             \
        getArray(__func__, ResourceProperty{session, resources, property}, array, count, status); \
    }                                                                                             \
    void nQITRMCAPI100_setGenericProperty##Name(nQITRMCAPI100_Session session,                    \
                                                const char* resources, const char* property,      \
                                                Written value, qierr_Status* status) {            \
        setScalar(__func__, ResourceProperty{session, resources, property}, value, status);       \
    }                                                                                             \
    void nQITRMCAPI100_setGenericProperty##Name##Array(                                           \
        nQITRMCAPI100_Session session, const char* resources, const char* property,               \
        Written const* array, std::uint32_t count, qierr_Status* status) {                        \
        setArray(__func__, ResourceProperty{session, resources, property}, array, count, status); \
    }

GENERIC_PROPERTY_FUNCTIONS(Bool, std::uint8_t, std::uint8_t)
GENERIC_PROPERTY_FUNCTIONS(Double, double, double)
GENERIC_PROPERTY_FUNCTIONS(Int32, std::int32_t, std::int32_t)
GENERIC_PROPERTY_FUNCTIONS(Int64, std::int64_t, std::int64_t)
GENERIC_PROPERTY_FUNCTIONS(String, char*, const char*)
GENERIC_PROPERTY_FUNCTIONS(UInt32, std::uint32_t, std::uint32_t)
GENERIC_PROPERTY_FUNCTIONS(UInt64, std::uint64_t, std::uint64_t)

#undef GENERIC_PROPERTY_FUNCTIONS

void nQITRMCAPI100_getDevicePropertyString(nQITRMCAPI100_Session session, const char* device,
                                           const char* property, char** value,
                                           qierr_Status* status) {
    getScalar(__func__, DeviceProperty{session, device, property}, value, status);
}

void nQITRMCAPI100_commitPropertiesGeneric(nQITRMCAPI100_Session session, const char* resources,
                                           qierr_Status* status) {
    const auto call = [&, function = __func__] {
        return Call(function).session(session).resources("resources", resources);
    };
    withSession(session, status, call, [&](Simulator& simulator, Session& owner) {
        PropertyAccessor(simulator, owner).commit(required(resources, "resources"));
    });
}
