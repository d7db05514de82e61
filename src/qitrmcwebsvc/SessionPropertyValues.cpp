// The typed reads and writes of SessionProperty: which function of the driver serves which scope,
// and how each type of value crosses to the driver and back.

#include <algorithm>
#include <type_traits>

#include "qitrmcwebsvc/SessionProperty.h"
#include "qitrmcwebsvc/callDriver.h"

namespace nQITRMCWEBSVC100 {

using namespace nQITRMCSHAREDCMN100;

namespace {

// The driver's functions for one read or write. Values: the parameters that carry the value.
template <typename... Values>
struct Operation {
    using Scoped = void (*)(nQITRMCAPI100_Session, const char* property, Values..., qierr_Status*);
    using Generic = void (*)(nQITRMCAPI100_Session, const char* resources, const char* property,
                             Values..., qierr_Status*);

    Scoped system;   // null where there is none
    Scoped session;  // null where there is none
    bool genericServesSession;
    Generic generic;
};

// How a value of a type crosses: numbers and truth values as they are, a truth value as one byte.
template <typename Value>
struct Crossing {
    using Element = std::conditional_t<std::is_same_v<Value, bool>, std::uint8_t, Value>;
    using Read = Operation<Element*>;
    using Write = Operation<Element>;

    template <typename Call>
    static Value read(Call call) {
        Element value = 0;
        call(&value);
        return static_cast<Value>(value);
    }
    template <typename Call>
    static void write(Value value, Call call) {
        call(static_cast<Element>(value));
    }
};

template <>
struct Crossing<std::string> {
    using Read = Operation<char**>;
    using Write = Operation<const char*>;

    template <typename Call>
    static std::string read(Call call) {
        DriverString value;
        call(value.out());
        return value.copy();
    }
    template <typename Call>
    static void write(const std::string& value, Call call) {
        call(value.c_str());
    }
};

template <typename Item>
struct Crossing<std::vector<Item>> {
    using Element = typename Crossing<Item>::Element;
    using Read = Operation<Element**, std::uint32_t*>;
    using Write = Operation<const Element*, std::uint32_t>;

    template <typename Call>
    static std::vector<Item> read(Call call) {
        DriverArray<Element> values;
        call(values.outArray(), values.outCount());
        return std::vector<Item>(values.begin(), values.end());
    }
    template <typename Call>
    static void write(const std::vector<Item>& values, Call call) {
        const auto count = static_cast<std::uint32_t>(values.size());
        if constexpr (std::is_same_v<Item, bool>) {
            DriverArray<Element> bytes(count);
            std::copy(values.begin(), values.end(), bytes.data());
            call(bytes.data(), count);
        } else {
            call(values.data(), count);
        }
    }
};

template <>
struct Crossing<std::vector<std::string>> {
    using Read = Operation<char***, std::uint32_t*>;
    using Write = Operation<const char* const*, std::uint32_t>;

    template <typename Call>
    static std::vector<std::string> read(Call call) {
        DriverStringArray values;
        call(values.outArray(), values.outCount());
        return std::vector<std::string>(values.begin(), values.end());
    }
    template <typename Call>
    static void write(const std::vector<std::string>& values, Call call) {
        std::vector<const char*> texts;
        texts.reserve(values.size());
        for (const std::string& value : values)
            texts.push_back(value.c_str());
        call(texts.data(), static_cast<std::uint32_t>(texts.size()));
    }
};

// What the last columns of the type table stand for.
#define QITRMC_SCOPED_Own(function) function
#define QITRMC_SCOPED_Generic(function) nullptr
#define QITRMC_SCOPED_None(function) nullptr
enum Service { None, Own, Generic };

#define QITRMC_OPERATION(verb, Type, system, session)                             \
    {                                                                             \
        QITRMC_SCOPED_##system(nQITRMCAPI100_##verb##SystemProperty##Type),       \
            QITRMC_SCOPED_##session(nQITRMCAPI100_##verb##SessionProperty##Type), \
            session == Generic, nQITRMCAPI100_##verb##GenericProperty##Type       \
    }

#define QITRMC_PROPERTY_TYPE(number, Type, Value, systemRead, sessionRead, systemWrite, \
                             sessionWrite)                                              \
    constexpr Crossing<Value>::Read read##Type =                                        \
        QITRMC_OPERATION(get, Type, systemRead, sessionRead);                           \
    constexpr Crossing<Value>::Write write##Type =                                      \
        QITRMC_OPERATION(set, Type, systemWrite, sessionWrite);
#include "qitrmcwebsvc/propertyTypes.def"

}  // namespace

// The driver's function for the property's category, which wants only the value now.
template <typename Operation>
auto SessionProperty::choose(const Operation& operation) const {
    const bool ofSession = propertyCategory == PropertyCategory::Session;
    const bool isGeneric = isOnResources() || (ofSession && operation.genericServesSession);
    const auto scoped = ofSession ? operation.session : operation.system;
    if (!isGeneric && scoped == nullptr)
        throw InternalError("Unsupported property category.", QITRMC_HERE);
    return [this, isGeneric, scoped, generic = operation.generic](auto... value) {
        if (isGeneric)
            callDriver(generic, session->driverSession, joinedResources.c_str(), name.c_str(),
                       value...);
        else
            callDriver(scoped, session->driverSession, name.c_str(), value...);
    };
}

#define QITRMC_PROPERTY_TYPE(number, Type, Value, ...)      \
    Value SessionProperty::get##Type() const {              \
        return Crossing<Value>::read(choose(read##Type));   \
    }                                                       \
    void SessionProperty::set##Type(const Value& value) {   \
        Crossing<Value>::write(value, choose(write##Type)); \
    }
#include "qitrmcwebsvc/propertyTypes.def"

}  // namespace nQITRMCWEBSVC100
