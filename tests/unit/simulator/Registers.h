#pragma once

#include "Values.h"

namespace drivertest {

template <typename Number>
Answer<Number> read(void (*function)(Handle, const char*, std::uint32_t, Number*, qierr_Status*),
                    Handle session, const char* device, std::uint32_t address) {
    Answer<Number> answer;
    answer.value = 99;
    Status status;
    function(session, device, address, &answer.value, &status);
    answer.code = status.code;
    answer.text = status.text();
    return answer;
}

template <typename Number>
Outcome tryWrite(void (*function)(Handle, const char*, std::uint32_t, Number, qierr_Status*),
                 Handle session, const char* device, std::uint32_t address, Number value) {
    Status status;
    function(session, device, address, value, &status);
    return {status.code, status.text()};
}

template <typename Number>
std::int32_t write(void (*function)(Handle, const char*, std::uint32_t, Number, qierr_Status*),
                   Handle session, const char* device, std::uint32_t address, Number value) {
    return tryWrite(function, session, device, address, value).code;
}

constexpr auto read8 = nQITRMCAPI100_readRegisterUInt8;
constexpr auto read16 = nQITRMCAPI100_readRegisterUInt16;
constexpr auto read32 = nQITRMCAPI100_readRegisterUInt32;
constexpr auto read64 = nQITRMCAPI100_readRegisterUInt64;
constexpr auto write8 = nQITRMCAPI100_writeRegisterUInt8;
constexpr auto write16 = nQITRMCAPI100_writeRegisterUInt16;
constexpr auto write32 = nQITRMCAPI100_writeRegisterUInt32;
constexpr auto write64 = nQITRMCAPI100_writeRegisterUInt64;

// The details of a status about a register.
inline std::string atRegister(std::uint32_t address) {
    return "{\"type\":\"usage\",\"usage\":\"kUsageTypeRegisterAddress\",\"value\":" +
           std::to_string(address) + ",\"value_type\":\"uint32_t\"}";
}
inline std::string where(std::uint32_t address, std::uint32_t bits) {
    return atRegister(address) +
           ",{\"type\":\"usage\",\"usage\":\"kUsageTypeRegisterWidth\",\"value\":" +
           std::to_string(bits) + ",\"value_type\":\"uint32_t\"}";
}

}  // namespace drivertest
