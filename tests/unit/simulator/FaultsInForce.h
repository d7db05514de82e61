#pragma once

#include "Driver.h"
#include "qitrmcsim.h"

namespace drivertest {

// The result of qitrmcsim_setFaults: the code, and the message.
struct Setting {
    std::int32_t code;
    std::string reason;
};

inline std::ostream& operator<<(std::ostream& out, const Setting& setting) {
    return out << setting.code << " " << setting.reason;
}

inline Setting setFaults(const std::string& json) {
    char* reason = nullptr;
    const std::int32_t code = qitrmcsim_setFaults(json.c_str(), &reason);
    const Setting setting{code, reason != nullptr ? reason : ""};
    nQITRMCAPI100_freeString(reason);
    return setting;
}

// Faults that are removed at the end of the scope.
class FaultsInForce {
  public:
    explicit FaultsInForce(const std::string& json) { replace(json); }
    FaultsInForce(const FaultsInForce&) = delete;
    FaultsInForce& operator=(const FaultsInForce&) = delete;
    ~FaultsInForce() { replace("{}"); }

    void replace(const std::string& json) {
        const Setting setting = setFaults(json);
        EXPECT_EQ(setting.code, 0) << setting.reason << " in " << json;
    }
};

// A description with one fault.
inline std::string oneFault(const std::string& members) {
    return "{\"faults\":[{" + members + "}]}";
}

}  // namespace drivertest
