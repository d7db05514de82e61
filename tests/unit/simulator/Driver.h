#pragma once

#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>
#include <string>
#include <vector>

#include "qitrmcapi.h"

namespace drivertest {

// A status record of the caller. It checks that its text follows the buffer format.
class Status : public qierr_Status {
  public:
    Status() : qierr_Status{0, 0, &Status::grow, nullptr} {}
    Status(const Status&) = delete;
    Status& operator=(const Status&) = delete;
    ~Status() { std::free(json); }

    std::string text() const {
        if (json == nullptr) {
            return "";
        }
        EXPECT_GE(capacity, 3u);
        const std::string content(json);
        EXPECT_EQ(json[capacity - 1], 'J');
        for (std::uint32_t i = static_cast<std::uint32_t>(content.size()); i + 1 < capacity; ++i) {
            EXPECT_EQ(json[i], '\0') << "at byte " << i;
        }
        return content;
    }

    // Makes every later growth fail.
    void starve() { reallocJson = &Status::refuse; }

    std::uint32_t growths = 0;

  private:
    static std::int32_t grow(qierr_Status* status, std::uint32_t size) {
        auto& self = *static_cast<Status*>(status);
        ++self.growths;
        auto* bigger = static_cast<char*>(std::calloc(1, size));
        if (self.json != nullptr) {
            std::memcpy(bigger, self.json, std::strlen(self.json));
            std::free(self.json);
        }
        bigger[size - 1] = 'J';
        self.json = bigger;
        self.capacity = size;
        return 1;
    }
    static std::int32_t refuse(qierr_Status*, std::uint32_t) { return 0; }
};

// The text of a status with one labelled value or none.
inline std::string detailsOf(const std::string& constant, const std::string& entries) {
    return "{\"error_constant\":\"qitrmcsim_" + constant +
           "\",\"component\":\"qitrmcapi\",\"translator\":\"mxlator_qitrmc\","
           "\"translator_info\":{\"ordered_data\":[" +
           entries + "]}}";
}
inline std::string usage(const std::string& tag, const std::string& value) {
    return "{\"type\":\"usage\",\"usage\":\"kUsageType" + tag + "\",\"value\":" + value +
           ",\"value_type\":\"string\"}";
}

using Names = std::vector<std::string>;
using Handle = nQITRMCAPI100_Session;

inline Names takeNames(char** array, std::uint32_t count) {
    Names names(array, array + count);
    nQITRMCAPI100_freeStringArray(array, count);
    return names;
}

// A session that is closed at the end of its scope. Its operations return the status code.
class Session {
  public:
    Session() {
        Status status;
        nQITRMCAPI100_initializeSessionWithoutResources(&handle, &status);
        EXPECT_EQ(status.code, 0) << status.text();
    }
    explicit Session(const char* devices, std::int32_t access = 3, const char* group = "") {
        Status status;
        nQITRMCAPI100_initializeSessionWithDevices(&handle, devices, 60.0, access, group, 0.0,
                                                   &status);
        EXPECT_EQ(status.code, 0) << status.text();
    }
    Session(const Session&) = delete;
    Session& operator=(const Session&) = delete;
    ~Session() { close(); }

    operator Handle() const { return handle; }

    std::int32_t close() {
        if (handle == 0) {
            return 0;
        }
        Status status;
        nQITRMCAPI100_closeSession(handle, &status);
        handle = 0;
        return status.code;
    }
    std::int32_t abort() {
        Status status;
        nQITRMCAPI100_abortSession(handle, &status);
        return status.code;
    }
    std::int32_t reserve(const char* devices, std::int32_t access = 3, const char* group = "",
                         double timeout = 0.0) {
        Status status;
        nQITRMCAPI100_reserveDevices(handle, devices, access, group, timeout, &status);
        return status.code;
    }
    std::int32_t unreserve(const char* devices) {
        Status status;
        nQITRMCAPI100_unreserveDevices(handle, devices, &status);
        return status.code;
    }
    Names list(const char* property) {
        Status status;
        char** array = nullptr;
        std::uint32_t count = 0;
        nQITRMCAPI100_getSessionPropertyStringArray(handle, property, &array, &count, &status);
        EXPECT_EQ(status.code, 0) << status.text();
        return takeNames(array, count);
    }
    Names systemList(const char* property) {
        Status status;
        char** array = nullptr;
        std::uint32_t count = 0;
        nQITRMCAPI100_getSystemPropertyStringArray(handle, property, &array, &count, &status);
        EXPECT_EQ(status.code, 0) << status.text();
        return takeNames(array, count);
    }
    Names deviceList(const char* device, const char* property) {
        Status status;
        char** array = nullptr;
        std::uint32_t count = 0;
        nQITRMCAPI100_getGenericPropertyStringArray(handle, device, property, &array, &count,
                                                    &status);
        EXPECT_EQ(status.code, 0) << status.text();
        return takeNames(array, count);
    }

    Handle handle = 0;
};

}  // namespace drivertest
