#include "support/RecordingDriver.h"

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <type_traits>
#include <utility>

#include "qierr/Status.h"
#include "qierr/Writer.h"
#include "support/FaultFree.h"

RecordingDriver& RecordingDriver::instance() {
    static RecordingDriver driver;
    return driver;
}

void RecordingDriver::reset() {
    std::lock_guard<std::mutex> hold(mutex);
    recorded.clear();
    replies.clear();
    lentCount = 0;
}

void RecordingDriver::reply(const std::string& call, Reply reply) {
    std::lock_guard<std::mutex> hold(mutex);
    replies[call] = std::move(reply);
}

std::vector<std::string> RecordingDriver::calls() const {
    std::lock_guard<std::mutex> hold(mutex);
    return recorded;
}

std::vector<std::string> RecordingDriver::takeCalls() {
    std::lock_guard<std::mutex> hold(mutex);
    return std::exchange(recorded, {});
}

int RecordingDriver::outstanding() const {
    std::lock_guard<std::mutex> hold(mutex);
    return lentCount;
}

RecordingDriver::Reply RecordingDriver::record(const std::string& name,
                                               const std::string& arguments) {
    const FaultFree spared;
    const std::string call = name + "(" + arguments + ")";
    Reply reply;
    {
        std::lock_guard<std::mutex> hold(mutex);
        recorded.push_back(call);
        for (const std::string& key : {call, name}) {
            const auto found = replies.find(key);
            if (found != replies.end()) {
                reply = found->second;
                break;
            }
        }
    }
    if (reply.during) {
        reply.during();
    }
    return reply.workedOut ? reply.workedOut(call) : reply;
}

void RecordingDriver::count(int change) {
    std::lock_guard<std::mutex> hold(mutex);
    lentCount += change;
}

namespace {

using Reply = RecordingDriver::Reply;

// ---- How arguments are recorded -----------------------------------------------------------------

std::string written(const char* text) {
    return text == nullptr ? "null" : "\"" + std::string(text) + "\"";
}

std::string written(double number) {
    char text[40];
    std::snprintf(text, sizeof text, "%.17g", number);
    return text;
}

template <typename Integer, typename = std::enable_if_t<std::is_integral_v<Integer>>>
std::string written(Integer number) {
    return std::to_string(number);
}

template <typename Element>
struct Array {
    const Element* elements;
    std::uint32_t count;
};

template <typename Element>
Array<Element> arrayOf(const Element* elements, std::uint32_t count) {
    return {elements, count};
}

template <typename Element>
std::string written(const Array<Element>& array) {
    std::string text = array.elements == nullptr ? "null" : "[";
    for (std::uint32_t i = 0; array.elements != nullptr && i < array.count; ++i) {
        text += (i != 0 ? "," : "") + written(array.elements[i]);
    }
    return array.elements == nullptr ? text : text + "]";
}

template <typename... Arguments>
std::string list(const Arguments&... arguments) {
    const FaultFree spared;
    std::string text;
    ((text += (text.empty() ? "" : ", ") + written(arguments)), ...);
    return text;
}

Reply called(const char* name, const std::string& arguments, qierr_Status* status) {
    Reply reply = RecordingDriver::instance().record(name, arguments);
    if (reply.code != 0 && qierr_Status_setCode(status, reply.code) && !reply.json.empty()) {
        qierr_Status_setJson(status, reply.json.c_str());
    }
    return reply;
}

// ---- How replies are returned -------------------------------------------------------------------

template <typename Number>
Number numberIn(const Reply& reply) {
    return std::visit(
        [](const auto& value) -> Number {
            using Held = std::decay_t<decltype(value)>;
            if constexpr (std::is_arithmetic_v<Held>) {
                return static_cast<Number>(value);
            } else {
                return Number{};
            }
        },
        reply.value);
}

char* lentText(const std::string& text) {
    const FaultFree spared;
    char* copy = static_cast<char*>(std::malloc(text.size() + 1));
    std::memcpy(copy, text.c_str(), text.size() + 1);
    return copy;
}

template <typename Number>
void give(const Reply& reply, Number* out) {
    *out = numberIn<Number>(reply);
}

void give(const Reply& reply, char** out) {
    const auto* text = std::get_if<std::string>(&reply.value);
    *out = text != nullptr ? lentText(*text) : nullptr;
    if (text != nullptr) {
        RecordingDriver::instance().lend();
    }
}

template <typename Number>
void giveArray(const Reply& reply, Number** out, std::uint32_t* count) {
    const FaultFree spared;
    *out = nullptr;
    *count = reply.countOfNoArray;
    std::visit(
        [&](const auto& values) {
            using Held = std::decay_t<decltype(values)>;
            if constexpr (!std::is_arithmetic_v<Held> && !std::is_same_v<Held, std::string> &&
                          !std::is_same_v<Held, std::monostate>) {
                if constexpr (std::is_arithmetic_v<typename Held::value_type>) {
                    *out = static_cast<Number*>(std::malloc((values.size() + 1) * sizeof(Number)));
                    *count = 0;
                    for (auto value : values) {
                        (*out)[(*count)++] = static_cast<Number>(value);
                    }
                    RecordingDriver::instance().lend();
                }
            }
        },
        reply.value);
}

void giveArray(const Reply& reply, char*** out, std::uint32_t* count) {
    const auto* texts = std::get_if<std::vector<std::string>>(&reply.value);
    const FaultFree spared;
    *out = nullptr;
    *count = reply.countOfNoArray;
    if (texts == nullptr) {
        return;
    }
    *count = 0;
    *out = static_cast<char**>(std::malloc((texts->size() + 1) * sizeof(char*)));
    for (const std::string& text : *texts) {
        (*out)[(*count)++] = lentText(text);
    }
    RecordingDriver::instance().lend();
}

}  // namespace

// ---- The driver's functions ---------------------------------------------------------------------

#define SESSION nQITRMCAPI100_Session session
#define DEFINE(name, ...) void nQITRMCAPI100_##name(__VA_ARGS__, qierr_Status* status)

extern "C" {

void nQITRMCAPI100_freeString(char* text) {
    RecordingDriver::instance().record("freeString", text == nullptr ? "null" : "");
    RecordingDriver::instance().takeBack(text);
    std::free(text);
}

void nQITRMCAPI100_freeArray(void* array) {
    RecordingDriver::instance().record("freeArray", array == nullptr ? "null" : "");
    RecordingDriver::instance().takeBack(array);
    std::free(array);
}

void nQITRMCAPI100_freeStringArray(char** array, std::uint32_t count) {
    RecordingDriver::instance().record("freeStringArray", array == nullptr ? "null" : list(count));
    RecordingDriver::instance().takeBack(array);
    for (std::uint32_t i = 0; array != nullptr && i < count; ++i) {
        std::free(array[i]);
    }
    std::free(array);
}

std::int32_t nQITRMCAPI100_translateStaticEnumStringToValue(const char* enumeration,
                                                            const char* item) {
    return numberIn<std::int32_t>(RecordingDriver::instance().record(
        "translateStaticEnumStringToValue", list(enumeration, item)));
}

const char* nQITRMCAPI100_translateStaticEnumValueToString(const char* enumeration,
                                                           std::int32_t value) {
    const FaultFree spared;
    static thread_local std::string borrowed;
    const Reply reply = RecordingDriver::instance().record("translateStaticEnumValueToString",
                                                           list(enumeration, value));
    const auto* text = std::get_if<std::string>(&reply.value);
    borrowed = text != nullptr ? *text : "";
    return borrowed.c_str();
}

void nQITRMCAPI100_initializeSessionWithoutResources(nQITRMCAPI100_Session* session,
                                                     qierr_Status* status) {
    give(called("initializeSessionWithoutResources", "", status), session);
}

#define DEFINE_OPEN(kind)                                                                       \
    void nQITRMCAPI100_initializeSessionWith##kind(                                             \
        nQITRMCAPI100_Session* session, const char* names, double timeout, std::int32_t access, \
        const char* group, double reservationTimeout, qierr_Status* status) {                   \
        give(called("initializeSessionWith" #kind,                                              \
                    list(names, timeout, access, group, reservationTimeout), status),           \
             session);                                                                          \
    }
DEFINE_OPEN(Devices)
DEFINE_OPEN(PhysChans)
DEFINE_OPEN(NvmemAreas)

DEFINE(closeSession, SESSION) {
    called("closeSession", list(session), status);
}
DEFINE(abortSession, SESSION) {
    called("abortSession", list(session), status);
}
DEFINE(reserveDevices, SESSION, const char* devices, std::int32_t access, const char* group,
       double timeout) {
    called("reserveDevices", list(session, devices, access, group, timeout), status);
}
DEFINE(connectToDevices, SESSION, const char* devices, double timeout) {
    called("connectToDevices", list(session, devices, timeout), status);
}
DEFINE(renameDevice, SESSION, const char* device, const char* newName) {
    called("renameDevice", list(session, device, newName), status);
}

#define DEFINE_ON_RESOURCES(name)                        \
    DEFINE(name, SESSION, const char* resources) {       \
        called(#name, list(session, resources), status); \
    }
DEFINE_ON_RESOURCES(unreserveDevices)
DEFINE_ON_RESOURCES(disconnectFromDevices)
DEFINE_ON_RESOURCES(resetDevices)
DEFINE_ON_RESOURCES(commitPropertiesGeneric)
DEFINE_ON_RESOURCES(commitNvmemGeneric)

DEFINE(getDevicePropertyString, SESSION, const char* device, const char* property, char** value) {
    give(called("getDevicePropertyString", list(session, device, property), status), value);
}

// Properties of the system and of a session have no resources; all others do.
#define DEFINE_GET(scope, type, Out)                                                         \
    DEFINE(get##scope##Property##type, SESSION, const char* property, Out* value) {          \
        give(called("get" #scope "Property" #type, list(session, property), status), value); \
    }
#define DEFINE_SET(scope, type, In)                                                    \
    DEFINE(set##scope##Property##type, SESSION, const char* property, In value) {      \
        called("set" #scope "Property" #type, list(session, property, value), status); \
    }
#define DEFINE_GET_TEXTS(scope)                                                                \
    DEFINE(get##scope##PropertyStringArray, SESSION, const char* property, char*** array,      \
           std::uint32_t* count) {                                                             \
        giveArray(called("get" #scope "PropertyStringArray", list(session, property), status), \
                  array, count);                                                               \
    }

DEFINE_GET(System, Bool, std::uint8_t)
DEFINE_GET(System, Double, double)
DEFINE_GET(System, UInt64, std::uint64_t)
DEFINE_GET_TEXTS(System)
DEFINE_SET(System, Bool, std::uint8_t)
DEFINE_SET(System, Double, double)
DEFINE_GET(Session, Double, double)
DEFINE_GET_TEXTS(Session)
DEFINE_SET(Session, Double, double)
DEFINE(setSessionPropertyStringArray, SESSION, const char* property, const char* const* array,
       std::uint32_t count) {
    called("setSessionPropertyStringArray", list(session, property, arrayOf(array, count)), status);
}

#define DEFINE_GENERIC(type, Out, In)                                                             \
    DEFINE(getGenericProperty##type, SESSION, const char* resources, const char* property,        \
           Out* value) {                                                                          \
        give(called("getGenericProperty" #type, list(session, resources, property), status),      \
             value);                                                                              \
    }                                                                                             \
    DEFINE(getGenericProperty##type##Array, SESSION, const char* resources, const char* property, \
           Out** array, std::uint32_t* count) {                                                   \
        giveArray(called("getGenericProperty" #type "Array", list(session, resources, property),  \
                         status),                                                                 \
                  array, count);                                                                  \
    }                                                                                             \
    DEFINE(setGenericProperty##type, SESSION, const char* resources, const char* property,        \
           In value) {                                                                            \
        called("setGenericProperty" #type, list(session, resources, property, value), status);    \
    }                                                                                             \
    DEFINE(setGenericProperty##type##Array, SESSION, const char* resources, const char* property, \
           const In* array, std::uint32_t count) {                                                \
        called("setGenericProperty" #type "Array",                                                \
               list(session, resources, property, arrayOf(array, count)), status);                \
    }
using InText = const char*;
DEFINE_GENERIC(Bool, std::uint8_t, std::uint8_t)
DEFINE_GENERIC(Double, double, double)
DEFINE_GENERIC(Int32, std::int32_t, std::int32_t)
DEFINE_GENERIC(Int64, std::int64_t, std::int64_t)
DEFINE_GENERIC(String, char*, InText)
DEFINE_GENERIC(UInt32, std::uint32_t, std::uint32_t)
DEFINE_GENERIC(UInt64, std::uint64_t, std::uint64_t)

DEFINE(openDriverDefinedProperty, SESSION, const char* property, nQITRMCAPI100_Property* handle) {
    give(called("openDriverDefinedProperty", list(session, property), status), handle);
}
DEFINE(openGenericProperty, SESSION, const char* resource, const char* property,
       nQITRMCAPI100_Property* handle) {
    give(called("openGenericProperty", list(session, resource, property), status), handle);
}
DEFINE(closeProperty, nQITRMCAPI100_Property handle) {
    called("closeProperty", list(handle), status);
}

#define DEFINE_ATTRIBUTE(type, Out)                                                         \
    DEFINE(getPropertyProperty##type, nQITRMCAPI100_Property handle, const char* attribute, \
           Out* value) {                                                                    \
        give(called("getPropertyProperty" #type, list(handle, attribute), status), value);  \
    }
#define DEFINE_ATTRIBUTE_ARRAY(type, Out)                                                          \
    DEFINE(getPropertyProperty##type##Array, nQITRMCAPI100_Property handle, const char* attribute, \
           Out** array, std::uint32_t* count) {                                                    \
        giveArray(called("getPropertyProperty" #type "Array", list(handle, attribute), status),    \
                  array, count);                                                                   \
    }
DEFINE_ATTRIBUTE(Int32, std::int32_t)
DEFINE_ATTRIBUTE(Bool, std::uint8_t)
DEFINE_ATTRIBUTE(String, char*)
DEFINE_ATTRIBUTE_ARRAY(Int32, std::int32_t)
DEFINE_ATTRIBUTE_ARRAY(String, char*)

DEFINE(executeGenericCommand, SESSION, const char* resources, const char* command, double timeout) {
    called("executeGenericCommand", list(session, resources, command, timeout), status);
}
DEFINE(openGenericCommand, SESSION, const char* resources, const char* command,
       nQITRMCAPI100_Command* handle) {
    give(called("openGenericCommand", list(session, resources, command), status), handle);
}
DEFINE(closeCommand, nQITRMCAPI100_Command handle) {
    called("closeCommand", list(handle), status);
}
DEFINE(getCommandPropertyString, nQITRMCAPI100_Command handle, const char* attribute,
       char** value) {
    give(called("getCommandPropertyString", list(handle, attribute), status), value);
}

#define DEFINE_REGISTER(width)                                                                  \
    DEFINE(readRegisterUInt##width, SESSION, const char* device, std::uint32_t address,         \
           std::uint##width##_t* value) {                                                       \
        give(called("readRegisterUInt" #width, list(session, device, address), status), value); \
    }                                                                                           \
    DEFINE(writeRegisterUInt##width, SESSION, const char* device, std::uint32_t address,        \
           std::uint##width##_t value) {                                                        \
        called("writeRegisterUInt" #width, list(session, device, address, value), status);      \
    }
DEFINE_REGISTER(8)
DEFINE_REGISTER(16)
DEFINE_REGISTER(32)
DEFINE_REGISTER(64)

DEFINE(getNvmemBytes, SESSION, const char* area, std::uint32_t address, std::uint8_t* buffer,
       std::uint32_t size) {
    const Reply reply = called(
        "getNvmemBytes",
        list(session, area, address) + (buffer == nullptr ? ", null, " : ", ") + written(size),
        status);
    const auto* bytes = std::get_if<std::vector<std::uint64_t>>(&reply.value);
    for (std::uint32_t i = 0; bytes != nullptr && i < size && i < bytes->size(); ++i) {
        buffer[i] = static_cast<std::uint8_t>((*bytes)[i]);
    }
}
DEFINE(setNvmemBytes, SESSION, const char* area, std::uint32_t address, const std::uint8_t* bytes,
       std::uint32_t size, const char* serialNumber, const char* password) {
    called("setNvmemBytes",
           list(session, area, address, arrayOf(bytes, size), serialNumber, password), status);
}

}  // extern "C"
