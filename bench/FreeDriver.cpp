// A driver whose functions do almost nothing, linked in place of the real one so that only the
// service is measured. It returns constants, in constant memory where the interface allows it.
//
// Its names: devices Mod1 and so on, channels Mod1/ch0 to Mod1/ch7, the NVMEM area Mod1/user, and
// property lists as long as those of a real system. Every property is a Double of resources, or an
// array with one Double for each resource. Each session opened gets the next handle.

#include "FreeDriver.h"

#include <qitrmcapi.h>

#include <algorithm>
#include <atomic>
#include <cstdlib>
#include <cstring>
#include <iterator>
#include <string>
#include <vector>

namespace {

constexpr const char* systemProperties[] = {
    "Sys.ConfigChangeCount",  "Sys.DeviceProperties",  "Sys.Devices",
    "Sys.DiscoveryEnabled",   "Sys.DiscoveryInterval", "Sys.NVMEMAreaProperties",
    "Sys.PhysChanProperties", "Sys.SessionProperties", "Sys.Simulated",
    "Sys.SystemProperties",
};
constexpr const char* sessionProperties[] = {
    "Session.ConnectedDevices",
    "Session.DefaultDevices",
    "Session.DefaultNVMEMAreas",
    "Session.DefaultPhysChans",
    "Session.Comment",
    "Session.Language",
    "Session.ReservedDevices",
    "Session.TCPIP.ConnectTimeout",
    "Session.TCPIP.ConnectTimeoutPerIP",
    "Session.TCPIP.KeepAliveInterval",
    "Session.TCPIP.KeepAliveTimeout",
    "Session.TCPIP.MDNSBrowseTimeout",
    "Session.TCPIP.SendRecvTimeout",
    "Session.Timeout",
};
constexpr const char* deviceProperties[] = {
    "Dev.AddedToLocalConfig",
    "Dev.Commands",
    "Dev.Comment",
    "Dev.Events",
    "Dev.FirmwareVersion",
    "Dev.Modules",
    "Dev.NVMEM.Areas",
    "Dev.Name",
    "Dev.PhysChans",
    "Dev.ProductCategory",
    "Dev.ProductName",
    "Dev.ProductNum",
    "Dev.Properties",
    "Dev.SerialNum",
    "Dev.SlotNum",
    "Dev.TCPIP.EthernetIP",
    "Dev.TCPIP.Hostname",
    "Dev.TCPIP.LastConnectedEthernetIP",
    "Dev.Temperature",
};
constexpr const char* channels[] = {
    "Mod1/ch0", "Mod1/ch1", "Mod1/ch2", "Mod1/ch3", "Mod1/ch4", "Mod1/ch5", "Mod1/ch6", "Mod1/ch7",
};
constexpr const char* areas[] = {"Mod1/user"};

struct List {
    const char* name;
    const char* const* texts;
    std::size_t count;
};

template <std::size_t count>
constexpr List list(const char* name, const char* const (&texts)[count]) {
    return {name, texts, count};
}

struct Devices {
    explicit Devices(std::uint32_t count) {
        for (std::uint32_t i = 1; i <= count; ++i) {
            names.push_back("Mod" + std::to_string(i));
        }
        for (const std::string& name : names) {
            texts.push_back(name.c_str());
        }
    }

    std::vector<std::string> names;
    std::vector<const char*> texts;
};

List listOf(const Devices& all) {
    return {"Sys.Devices", all.texts.data(), all.texts.size()};
}

Devices devices(defaultDeviceCount);

List lists[] = {
    listOf(devices),
    list("Sys.SessionProperties", sessionProperties),
    list("Sys.SystemProperties", systemProperties),
    list("Sys.DeviceProperties", deviceProperties),
    list("Dev.PhysChans", channels),
    list("Dev.NVMEM.Areas", areas),
};

// An unknown list is empty. The caller does not modify the texts.
void lendList(const char* name, char*** array, std::uint32_t* count) {
    const auto found = std::find_if(std::begin(lists), std::end(lists), [&](const List& candidate) {
        return std::strcmp(candidate.name, name) == 0;
    });
    const bool known = found != std::end(lists);
    *array = known ? const_cast<char**>(found->texts) : nullptr;
    *count = known ? static_cast<std::uint32_t>(found->count) : 0;
}

using Session = nQITRMCAPI100_Session;
using Name = const char*;

std::atomic<Session> lastSession{0};

}  // namespace

void setDeviceCount(std::uint32_t count) {
    devices = Devices(count);
    lists[0] = listOf(devices);
}

#define DEFINE(name, ...) void nQITRMCAPI100_##name(__VA_ARGS__, qierr_Status*)
#define IDLE(name, ...) \
    DEFINE(name, __VA_ARGS__) {}

extern "C" {

// ---- Freeing ------------------------------------------------------------------------------------

void nQITRMCAPI100_freeString(char*) {}
void nQITRMCAPI100_freeStringArray(char**, std::uint32_t) {}
void nQITRMCAPI100_freeArray(void* array) {
    std::free(array);
}

std::int32_t nQITRMCAPI100_translateStaticEnumStringToValue(Name, Name) {
    return 3;
}
Name nQITRMCAPI100_translateStaticEnumValueToString(Name, std::int32_t) {
    return "Double";
}

// ---- Sessions and devices -----------------------------------------------------------------------

void nQITRMCAPI100_initializeSessionWithoutResources(Session* session, qierr_Status*) {
    *session = ++lastSession;
}
#define OPEN(kind)                                                                          \
    DEFINE(initializeSessionWith##kind, Session* session, Name, double, std::int32_t, Name, \
           double) {                                                                        \
        *session = ++lastSession;                                                           \
    }
OPEN(Devices)
OPEN(PhysChans)
OPEN(NvmemAreas)
IDLE(closeSession, Session)
IDLE(abortSession, Session)
IDLE(reserveDevices, Session, Name, std::int32_t, Name, double)
IDLE(unreserveDevices, Session, Name)
IDLE(connectToDevices, Session, Name, double)
IDLE(disconnectFromDevices, Session, Name)
IDLE(resetDevices, Session, Name)
IDLE(renameDevice, Session, Name, Name)
DEFINE(getDevicePropertyString, Session, Name, Name, char** value) {
    *value = nullptr;
}

// ---- Properties ---------------------------------------------------------------------------------

#define GET(name, Out, answer)                \
    DEFINE(name, Session, Name, Out* value) { \
        *value = answer;                      \
    }
GET(getSystemPropertyBool, std::uint8_t, 1)
GET(getSystemPropertyDouble, double, 0.5)
GET(getSystemPropertyUInt64, std::uint64_t, 1)
GET(getSessionPropertyDouble, double, 0.5)
IDLE(setSystemPropertyBool, Session, Name, std::uint8_t)
IDLE(setSystemPropertyDouble, Session, Name, double)
IDLE(setSessionPropertyDouble, Session, Name, double)
IDLE(setSessionPropertyStringArray, Session, Name, const Name*, std::uint32_t)
DEFINE(getSystemPropertyStringArray, Session, Name property, char*** array, std::uint32_t* count) {
    lendList(property, array, count);
}
DEFINE(getSessionPropertyStringArray, Session, Name property, char*** array, std::uint32_t* count) {
    lendList(property, array, count);
}

#define GENERIC(type, Out, In, answer)                                  \
    DEFINE(getGenericProperty##type, Session, Name, Name, Out* value) { \
        *value = answer;                                                \
    }                                                                   \
    IDLE(setGenericProperty##type, Session, Name, Name, In)             \
    IDLE(setGenericProperty##type##Array, Session, Name, Name, const In*, std::uint32_t)
#define GENERIC_ARRAY(type, Element)                                                        \
    DEFINE(getGenericProperty##type##Array, Session, Name resources, Name, Element** array, \
           std::uint32_t* count) {                                                          \
        const char* const end = resources + std::strlen(resources);                         \
        const auto size = static_cast<std::size_t>(std::count(resources, end, ',')) + 1;    \
        *array = static_cast<Element*>(std::calloc(size, sizeof(Element)));                 \
        *count = static_cast<std::uint32_t>(*array == nullptr ? 0 : size);                  \
    }
GENERIC(Bool, std::uint8_t, std::uint8_t, 1)
GENERIC(Double, double, double, 36.5)
GENERIC(Int32, std::int32_t, std::int32_t, 1)
GENERIC(Int64, std::int64_t, std::int64_t, 1)
GENERIC(String, char*, Name, nullptr)
GENERIC(UInt32, std::uint32_t, std::uint32_t, 1)
GENERIC(UInt64, std::uint64_t, std::uint64_t, 1)
GENERIC_ARRAY(Bool, std::uint8_t)
GENERIC_ARRAY(Double, double)
GENERIC_ARRAY(Int32, std::int32_t)
GENERIC_ARRAY(Int64, std::int64_t)
GENERIC_ARRAY(UInt32, std::uint32_t)
GENERIC_ARRAY(UInt64, std::uint64_t)
DEFINE(getGenericPropertyStringArray, Session, Name, Name property, char*** array,
       std::uint32_t* count) {
    lendList(property, array, count);
}
IDLE(commitPropertiesGeneric, Session, Name)

DEFINE(openDriverDefinedProperty, Session, Name, nQITRMCAPI100_Property* handle) {
    *handle = 1;
}
DEFINE(openGenericProperty, Session, Name, Name, nQITRMCAPI100_Property* handle) {
    *handle = 1;
}
IDLE(closeProperty, nQITRMCAPI100_Property)
#define ATTRIBUTE(type, Out, answer)                                              \
    DEFINE(getPropertyProperty##type, nQITRMCAPI100_Property, Name, Out* value) { \
        *value = answer;                                                          \
    }
ATTRIBUTE(Int32, std::int32_t, 2)
ATTRIBUTE(Bool, std::uint8_t, 0)
ATTRIBUTE(String, char*, nullptr)
#define ATTRIBUTE_ARRAY(type, Element)                                                      \
    DEFINE(getPropertyProperty##type##Array, nQITRMCAPI100_Property, Name, Element** array, \
           std::uint32_t* count) {                                                          \
        *array = nullptr;                                                                   \
        *count = 0;                                                                         \
    }
ATTRIBUTE_ARRAY(Int32, std::int32_t)
ATTRIBUTE_ARRAY(String, char*)

// ---- Commands, registers and non-volatile memory ------------------------------------------------

IDLE(executeGenericCommand, Session, Name, Name, double)
DEFINE(openGenericCommand, Session, Name, Name, nQITRMCAPI100_Command* handle) {
    *handle = 1;
}
IDLE(closeCommand, nQITRMCAPI100_Command)
DEFINE(getCommandPropertyString, nQITRMCAPI100_Command, Name, char** value) {
    *value = nullptr;
}

#define REGISTER(width)                                                                          \
    DEFINE(readRegisterUInt##width, Session, Name, std::uint32_t, std::uint##width##_t* value) { \
        *value = 90;                                                                             \
    }                                                                                            \
    IDLE(writeRegisterUInt##width, Session, Name, std::uint32_t, std::uint##width##_t)
REGISTER(8)
REGISTER(16)
REGISTER(32)
REGISTER(64)

DEFINE(getNvmemBytes, Session, Name, std::uint32_t, std::uint8_t* buffer, std::uint32_t size) {
    if (size != 0) {
        std::memset(buffer, 90, size);
    }
}
IDLE(setNvmemBytes, Session, Name, std::uint32_t, const std::uint8_t*, std::uint32_t, Name, Name)
IDLE(commitNvmemGeneric, Session, Name)

}  // extern "C"
