// The typed reads and writes of SessionProperty: the driver function for each category, and the
// conversion of each type of value.

#include <algorithm>

#include "qitrmcwebsvc/SessionProperty.h"
#include "qitrmcwebsvc/callDriver.h"

namespace nQITRMCWEBSVC100 {

using namespace nQITRMCSHAREDCMN100;

// The driver's functions for one type of read or write. There is always one for properties of
// resources, but not always for those of the system or a session. Values: the parameter types of
// the value.
template <typename... Values>
struct SessionProperty::Functions {
    using Generic = void (*)(nQITRMCAPI100_Session, const char* resources, const char* property,
                             Values..., qierr_Status*);
    using Scoped = void (*)(nQITRMCAPI100_Session, const char* property, Values..., qierr_Status*);

    Generic generic;
    Scoped system = nullptr;
    Scoped session = nullptr;
    bool genericServesSession = false;
};

// Binds all arguments but the value to the function for the property's category. Throws
// InternalError if there is no function, before the driver has allocated anything.
template <typename... Values>
auto SessionProperty::choose(const Functions<Values...>& functions) const {
    const bool ofSession = propertyCategory == PropertyCategory::Session;
    const bool isGeneric = isOnResources() || (ofSession && functions.genericServesSession);
    const auto scoped = ofSession ? functions.session : functions.system;
    if (!isGeneric && scoped == nullptr) {
        throw InternalError("Unsupported property category.", QITRMC_HERE);
    }
    return [this, isGeneric, scoped, generic = functions.generic](Values... values) {
        if (isGeneric) {
            callDriver(generic, session->driverSession, joinedResources.c_str(), name.c_str(),
                       values...);
        } else {
            callDriver(scoped, session->driverSession, name.c_str(), values...);
        }
    };
}

template <typename Number>
Number SessionProperty::readNumber(const Functions<Number*>& functions) const {
    Number value = 0;
    choose(functions)(&value);
    return value;
}

template <typename Number>
std::vector<Number> SessionProperty::readNumbers(
    const Functions<Number**, std::uint32_t*>& functions) const {
    const auto read = choose(functions);
    DriverArray<Number> values;
    read(values.outArray(), values.outCount());
    return std::vector<Number>(values.begin(), values.end());
}

template <typename Number>
void SessionProperty::writeNumbers(const Functions<const Number*, std::uint32_t>& functions,
                                   const std::vector<Number>& values) const {
    choose(functions)(values.data(), static_cast<std::uint32_t>(values.size()));
}

// The driver's Booleans are bytes.

bool SessionProperty::getBool() const {
    return readNumber<std::uint8_t>(
               {nQITRMCAPI100_getGenericPropertyBool, nQITRMCAPI100_getSystemPropertyBool}) != 0;
}

void SessionProperty::setBool(const bool& value) {
    choose<std::uint8_t>(
        {nQITRMCAPI100_setGenericPropertyBool, nQITRMCAPI100_setSystemPropertyBool})(value);
}

std::vector<bool> SessionProperty::getBoolArray() const {
    const auto bytes = readNumbers<std::uint8_t>({nQITRMCAPI100_getGenericPropertyBoolArray});
    return std::vector<bool>(bytes.begin(), bytes.end());
}

void SessionProperty::setBoolArray(const std::vector<bool>& values) {
    const auto write =
        choose<const std::uint8_t*, std::uint32_t>({nQITRMCAPI100_setGenericPropertyBoolArray});
    const auto count = static_cast<std::uint32_t>(values.size());
    DriverArray<std::uint8_t> bytes(count);
    std::copy(values.begin(), values.end(), bytes.data());
    write(bytes.data(), count);
}

double SessionProperty::getDouble() const {
    return readNumber<double>({nQITRMCAPI100_getGenericPropertyDouble,
                               nQITRMCAPI100_getSystemPropertyDouble,
                               nQITRMCAPI100_getSessionPropertyDouble});
}

void SessionProperty::setDouble(const double& value) {
    choose<double>({nQITRMCAPI100_setGenericPropertyDouble, nQITRMCAPI100_setSystemPropertyDouble,
                    nQITRMCAPI100_setSessionPropertyDouble})(value);
}

std::vector<double> SessionProperty::getDoubleArray() const {
    return readNumbers<double>({nQITRMCAPI100_getGenericPropertyDoubleArray});
}

void SessionProperty::setDoubleArray(const std::vector<double>& values) {
    writeNumbers<double>({nQITRMCAPI100_setGenericPropertyDoubleArray}, values);
}

std::int32_t SessionProperty::getInt32() const {
    return readNumber<std::int32_t>({nQITRMCAPI100_getGenericPropertyInt32});
}

void SessionProperty::setInt32(const std::int32_t& value) {
    choose<std::int32_t>({nQITRMCAPI100_setGenericPropertyInt32})(value);
}

std::vector<std::int32_t> SessionProperty::getInt32Array() const {
    return readNumbers<std::int32_t>({nQITRMCAPI100_getGenericPropertyInt32Array});
}

void SessionProperty::setInt32Array(const std::vector<std::int32_t>& values) {
    writeNumbers<std::int32_t>({nQITRMCAPI100_setGenericPropertyInt32Array}, values);
}

std::int64_t SessionProperty::getInt64() const {
    return readNumber<std::int64_t>({nQITRMCAPI100_getGenericPropertyInt64});
}

void SessionProperty::setInt64(const std::int64_t& value) {
    choose<std::int64_t>({nQITRMCAPI100_setGenericPropertyInt64})(value);
}

std::vector<std::int64_t> SessionProperty::getInt64Array() const {
    return readNumbers<std::int64_t>({nQITRMCAPI100_getGenericPropertyInt64Array});
}

void SessionProperty::setInt64Array(const std::vector<std::int64_t>& values) {
    writeNumbers<std::int64_t>({nQITRMCAPI100_setGenericPropertyInt64Array}, values);
}

std::uint32_t SessionProperty::getUInt32() const {
    return readNumber<std::uint32_t>({nQITRMCAPI100_getGenericPropertyUInt32});
}

void SessionProperty::setUInt32(const std::uint32_t& value) {
    choose<std::uint32_t>({nQITRMCAPI100_setGenericPropertyUInt32})(value);
}

std::vector<std::uint32_t> SessionProperty::getUInt32Array() const {
    return readNumbers<std::uint32_t>({nQITRMCAPI100_getGenericPropertyUInt32Array});
}

void SessionProperty::setUInt32Array(const std::vector<std::uint32_t>& values) {
    writeNumbers<std::uint32_t>({nQITRMCAPI100_setGenericPropertyUInt32Array}, values);
}

std::uint64_t SessionProperty::getUInt64() const {
    return readNumber<std::uint64_t>(
        {nQITRMCAPI100_getGenericPropertyUInt64, nQITRMCAPI100_getSystemPropertyUInt64});
}

void SessionProperty::setUInt64(const std::uint64_t& value) {
    choose<std::uint64_t>({nQITRMCAPI100_setGenericPropertyUInt64})(value);
}

std::vector<std::uint64_t> SessionProperty::getUInt64Array() const {
    return readNumbers<std::uint64_t>({nQITRMCAPI100_getGenericPropertyUInt64Array});
}

void SessionProperty::setUInt64Array(const std::vector<std::uint64_t>& values) {
    writeNumbers<std::uint64_t>({nQITRMCAPI100_setGenericPropertyUInt64Array}, values);
}

std::string SessionProperty::getString() const {
    const auto read = choose<char**>({nQITRMCAPI100_getGenericPropertyString});
    DriverString value;
    read(value.out());
    return value.copy();
}

// A text property of a session can be written, with the function for resources, but not read.
void SessionProperty::setString(const std::string& value) {
    choose<const char*>({nQITRMCAPI100_setGenericPropertyString, nullptr, nullptr, true})(
        value.c_str());
}

std::vector<std::string> SessionProperty::getStringArray() const {
    const auto read = choose<char***, std::uint32_t*>(
        {nQITRMCAPI100_getGenericPropertyStringArray, nQITRMCAPI100_getSystemPropertyStringArray,
         nQITRMCAPI100_getSessionPropertyStringArray});
    DriverStringArray values;
    read(values.outArray(), values.outCount());
    return std::vector<std::string>(values.begin(), values.end());
}

void SessionProperty::setStringArray(const std::vector<std::string>& values) {
    const auto write = choose<const char* const*, std::uint32_t>(
        {nQITRMCAPI100_setGenericPropertyStringArray, nullptr,
         nQITRMCAPI100_setSessionPropertyStringArray});
    std::vector<const char*> texts;
    texts.reserve(values.size());
    for (const std::string& value : values) {
        texts.push_back(value.c_str());
    }
    write(texts.data(), static_cast<std::uint32_t>(texts.size()));
}

}  // namespace nQITRMCWEBSVC100
