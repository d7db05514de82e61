// The properties of the system and of the session.

#include "entries/TypedValues.h"
#include "sessions/PropertyDesk.h"

using namespace simulator;

namespace {

using Read = Elements (PropertyDesk::*)(std::string_view, DataType);
using Write = void (PropertyDesk::*)(std::string_view, DataType, const Elements&);

template <typename Value>
void getScalar(const char* function, Read read, nQITRMCAPI100_Session session, const char* property,
               DataType type, Value* value, qierr_Status* status) {
    clearOutputs(status, value);
    const auto call = [&] {
        return Call(function).session(session).in("property", property).out("value", value);
    };
    withSession(session, status, call, [&](Simulator& simulator, Session& owner) {
        PropertyDesk desk(simulator, owner);
        lendScalar((desk.*read)(required(property, "property"), type), value);
    });
}

void getTexts(const char* function, Read read, nQITRMCAPI100_Session session, const char* property,
              char*** array, uint32_t* count, qierr_Status* status) {
    clearOutputs(status, array, count);
    const auto call = [&] {
        return Call(function).session(session).in("property", property).out("array", array, count);
    };
    withSession(session, status, call, [&](Simulator& simulator, Session& owner) {
        PropertyDesk desk(simulator, owner);
        lendArray((desk.*read)(required(property, "property"), DataType::textArray), array, count);
    });
}

template <typename Value>
void setScalar(const char* function, Write write, nQITRMCAPI100_Session session,
               const char* property, DataType type, Value value, qierr_Status* status) {
    const auto call = [&] {
        return Call(function).session(session).in("property", property).in("value", value);
    };
    withSession(session, status, call, [&](Simulator& simulator, Session& owner) {
        PropertyDesk desk(simulator, owner);
        (desk.*write)(required(property, "property"), type, asElements(value));
    });
}

}  // namespace

void nQITRMCAPI100_getSystemPropertyBool(nQITRMCAPI100_Session session, const char* property,
                                         uint8_t* value, qierr_Status* status) {
    getScalar(__func__, &PropertyDesk::readSystem, session, property, DataType::boolean, value,
              status);
}

void nQITRMCAPI100_getSystemPropertyDouble(nQITRMCAPI100_Session session, const char* property,
                                           double* value, qierr_Status* status) {
    getScalar(__func__, &PropertyDesk::readSystem, session, property, DataType::real, value,
              status);
}

void nQITRMCAPI100_getSystemPropertyUInt64(nQITRMCAPI100_Session session, const char* property,
                                           uint64_t* value, qierr_Status* status) {
    getScalar(__func__, &PropertyDesk::readSystem, session, property, DataType::uint64, value,
              status);
}

void nQITRMCAPI100_getSystemPropertyStringArray(nQITRMCAPI100_Session session, const char* property,
                                                char*** array, uint32_t* count,
                                                qierr_Status* status) {
    getTexts(__func__, &PropertyDesk::readSystem, session, property, array, count, status);
}

void nQITRMCAPI100_setSystemPropertyBool(nQITRMCAPI100_Session session, const char* property,
                                         uint8_t value, qierr_Status* status) {
    setScalar(__func__, &PropertyDesk::writeSystem, session, property, DataType::boolean, value,
              status);
}

void nQITRMCAPI100_setSystemPropertyDouble(nQITRMCAPI100_Session session, const char* property,
                                           double value, qierr_Status* status) {
    setScalar(__func__, &PropertyDesk::writeSystem, session, property, DataType::real, value,
              status);
}

void nQITRMCAPI100_getSessionPropertyDouble(nQITRMCAPI100_Session session, const char* property,
                                            double* value, qierr_Status* status) {
    getScalar(__func__, &PropertyDesk::readSession, session, property, DataType::real, value,
              status);
}

void nQITRMCAPI100_getSessionPropertyStringArray(nQITRMCAPI100_Session session,
                                                 const char* property, char*** array,
                                                 uint32_t* count, qierr_Status* status) {
    getTexts(__func__, &PropertyDesk::readSession, session, property, array, count, status);
}

void nQITRMCAPI100_setSessionPropertyDouble(nQITRMCAPI100_Session session, const char* property,
                                            double value, qierr_Status* status) {
    setScalar(__func__, &PropertyDesk::writeSession, session, property, DataType::real, value,
              status);
}

void nQITRMCAPI100_setSessionPropertyStringArray(nQITRMCAPI100_Session session,
                                                 const char* property, const char* const* array,
                                                 uint32_t count, qierr_Status* status) {
    const auto call = [&, function = __func__] {
        return Call(function).session(session).in("property", property).in("array", array, count);
    };
    withSession(session, status, call, [&](Simulator& simulator, Session& owner) {
        PropertyDesk(simulator, owner)
            .writeSession(required(property, "property"), DataType::textArray,
                          asElements(array, count));
    });
}
