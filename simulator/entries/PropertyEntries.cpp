// The properties of the system and of the session.

#include "entries/ValueFunctions.h"
#include "sessions/PropertyAccessor.h"

using namespace simulator;

namespace {

struct OwnProperty {
    Category category;
    nQITRMCAPI100_Session session;
    const char* name;

    Call describe(const char* function) const {
        return Call(function).session(session).in("property", name);
    }
    ReadValue read(Simulator& simulator, DataType type) const {
        return PropertyAccessor(simulator, simulator.sessions.get(session))
            .readIn(category, required(name, "property"), type);
    }
    void write(Simulator& simulator, DataType type, const Elements& values) const {
        PropertyAccessor(simulator, simulator.sessions.get(session))
            .writeIn(category, required(name, "property"), type, values);
    }
};

}  // namespace

void nQITRMCAPI100_getSystemPropertyBool(nQITRMCAPI100_Session session, const char* property,
                                         std::uint8_t* value, qierr_Status* status) {
    getScalar(__func__, OwnProperty{Category::System, session, property}, value, status);
}

void nQITRMCAPI100_getSystemPropertyDouble(nQITRMCAPI100_Session session, const char* property,
                                           double* value, qierr_Status* status) {
    getScalar(__func__, OwnProperty{Category::System, session, property}, value, status);
}

void nQITRMCAPI100_getSystemPropertyUInt64(nQITRMCAPI100_Session session, const char* property,
                                           std::uint64_t* value, qierr_Status* status) {
    getScalar(__func__, OwnProperty{Category::System, session, property}, value, status);
}

void nQITRMCAPI100_getSystemPropertyStringArray(nQITRMCAPI100_Session session, const char* property,
                                                char*** array, std::uint32_t* count,
                                                qierr_Status* status) {
    getArray(__func__, OwnProperty{Category::System, session, property}, array, count, status);
}

void nQITRMCAPI100_setSystemPropertyBool(nQITRMCAPI100_Session session, const char* property,
                                         std::uint8_t value, qierr_Status* status) {
    setScalar(__func__, OwnProperty{Category::System, session, property}, value, status);
}

void nQITRMCAPI100_setSystemPropertyDouble(nQITRMCAPI100_Session session, const char* property,
                                           double value, qierr_Status* status) {
    setScalar(__func__, OwnProperty{Category::System, session, property}, value, status);
}

void nQITRMCAPI100_getSessionPropertyDouble(nQITRMCAPI100_Session session, const char* property,
                                            double* value, qierr_Status* status) {
    getScalar(__func__, OwnProperty{Category::Session, session, property}, value, status);
}

void nQITRMCAPI100_getSessionPropertyStringArray(nQITRMCAPI100_Session session,
                                                 const char* property, char*** array,
                                                 std::uint32_t* count, qierr_Status* status) {
    getArray(__func__, OwnProperty{Category::Session, session, property}, array, count, status);
}

void nQITRMCAPI100_setSessionPropertyDouble(nQITRMCAPI100_Session session, const char* property,
                                            double value, qierr_Status* status) {
    setScalar(__func__, OwnProperty{Category::Session, session, property}, value, status);
}

void nQITRMCAPI100_setSessionPropertyStringArray(nQITRMCAPI100_Session session,
                                                 const char* property, const char* const* array,
                                                 std::uint32_t count, qierr_Status* status) {
    setArray(__func__, OwnProperty{Category::Session, session, property}, array, count, status);
}
