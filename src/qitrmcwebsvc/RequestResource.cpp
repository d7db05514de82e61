#include "qitrmcwebsvc/RequestResource.h"

#include <optional>
#include <utility>

#include "qitrmcsharedcmn/Exceptions.h"
#include "qitrmcsharedcmn/parseUtilities.h"
#include "qitrmcwebsvc/KnownNames.h"
#include "qitrmcwebsvc/findMember.h"
#include "qitrmcwebsvc/resourceTokens.h"

namespace nQITRMCWEBSVC100 {

using namespace nQITRMCSHAREDCMN100;

namespace {

// In the order of precedence: only the first of these members that a request has is read.
constexpr std::pair<const char*, ResourceKind> resourceMembers[] = {
    {"devices", ResourceKind::Device},
    {"physical_channels", ResourceKind::PhysicalChannel},
    {"nvmem_areas", ResourceKind::NvmemArea},
    {"device", ResourceKind::Device},
    {"physical_channel", ResourceKind::PhysicalChannel},
    {"nvmem_area", ResourceKind::NvmemArea},
};

BasicError invalidName(const std::string& name) {
    BasicError error(qierr::codes::invalidResourceName, QITRMC_HERE);
    addUsageString(error.details(), "kUsageTypeRequestedValue", name.c_str());
    return error;
}

}  // namespace

RequestResource::RequestResource(const JsonValue& params) {
    for (const auto& [member, kind] : resourceMembers) {
        const JsonValue* const value = findMember(params, member);
        if (value == nullptr) {
            continue;
        }
        readNames(*value);
        resourceKind = kind;
        return;
    }
}

void RequestResource::confirm(nQITRMCAPI100_Session driverSession, ResourceKind defaultKind) {
    if (resourceKind == ResourceKind::None) {
        applyDefault(defaultKind);
    } else if (const std::string* const name = firstUnknownName(driverSession)) {
        throw invalidName(*name);
    }
}

std::string RequestResource::joinedNames() const {
    return compressNames(resourceNames, NameKind::Path);
}

void RequestResource::readNames(const JsonValue& value) {
    const auto append = [&](const JsonValue& text) {
        const std::string list(text.GetString(), text.GetStringLength());
        // The driver reads a list up to its first NUL, so the names after it would be ignored.
        if (list.find('\0') != std::string::npos) {
            throw invalidName(list);
        }
        appendExpanded(resourceNames, list, NameKind::Path);
    };
    if (value.IsString()) {
        append(value);
    } else if (value.IsArray()) {
        for (const JsonValue& element : value.GetArray()) {
            append(element);
        }
    } else {
        throw InternalError("Invalid data type for the name of resource(s)", QITRMC_HERE);
    }
}

const std::string* RequestResource::firstUnknownName(nQITRMCAPI100_Session driverSession) const {
    const bool areDevices = resourceKind == ResourceKind::Device;
    const char* property =
        resourceKind == ResourceKind::PhysicalChannel ? "Dev.PhysChans" : "Dev.NVMEM.Areas";
    std::optional<KnownNames> known;
    if (areDevices) {
        known.emplace(driverSession);
    }
    for (const std::string& name : resourceNames) {
        // The driver's names do not contain the tokens.
        if (propertyOfToken(name) != nullptr) {
            continue;
        }
        if (!areDevices) {
            known.emplace(driverSession, name.substr(0, name.find('/')), property);
        }
        if (!known->contains(name)) {
            return &name;
        }
    }
    return nullptr;
}

void RequestResource::applyDefault(ResourceKind defaultKind) {
    resourceKind = defaultKind;
    if (const char* token = defaultTokenOf(defaultKind)) {
        resourceNames.push_back(token);
    }
}

}  // namespace nQITRMCWEBSVC100
