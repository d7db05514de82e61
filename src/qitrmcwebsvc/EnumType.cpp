#include "qitrmcwebsvc/EnumType.h"

#include <qitrmcapi.h>

#include <utility>

#include "qitrmcsharedcmn/Exceptions.h"

namespace nQITRMCWEBSVC100 {
namespace {

std::int32_t numberOf(const JsonValue& value, const std::string& enumerationName) {
    if (value.IsInt()) {
        return value.GetInt();
    }
    if (value.IsString()) {
        return nQITRMCAPI100_translateStaticEnumStringToValue(enumerationName.c_str(),
                                                              value.GetString());
    }
    throw nQITRMCSHAREDCMN100::InternalError("Fail to parse enum type.", QITRMC_HERE);
}

}  // namespace

EnumType::EnumType(const JsonValue& value, std::string enumerationName)
    : enumerationName(std::move(enumerationName)), number(numberOf(value, this->enumerationName)) {}

}  // namespace nQITRMCWEBSVC100
