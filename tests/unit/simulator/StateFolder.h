#pragma once

#include <sys/wait.h>
#include <unistd.h>

#include <filesystem>
#include <functional>
#include <map>

#include "ChassisFile.h"
#include "Values.h"

namespace drivertest {

inline std::string contentOf(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(file), {});
}

// A folder for the state of a chassis, removed with this object. The test itself never uses the
// driver: each use is a process of its own, which is equivalent to a restart.
class StateFolder {
  public:
    StateFolder() {
        std::string pattern = "/tmp/stateXXXXXX";
        EXPECT_NE(mkdtemp(pattern.data()), nullptr);
        path = pattern;
    }
    StateFolder(const StateFolder&) = delete;
    StateFolder& operator=(const StateFolder&) = delete;
    ~StateFolder() { std::filesystem::remove_all(path); }

    std::string file(const std::string& name) const { return path + "/" + name; }

    // The contents of the files that hold values, by name.
    std::map<std::string, std::string> files() const {
        std::map<std::string, std::string> found;
        for (const auto& entry : std::filesystem::directory_iterator(path)) {
            const std::string name = entry.path().filename().string();
            if (name.compare(0, 7, "change-") == 0 && entry.is_regular_file()) {
                found[name] = contentOf(entry.path().string());
            }
        }
        return found;
    }
    void put(const std::string& name, const std::string& content) const {
        std::ofstream(file(name), std::ios::binary) << content;
    }

    // Starts a process on this folder that runs body and ends. Returns its id.
    pid_t start(const std::function<void()>& body) const {
        std::fflush(nullptr);
        const pid_t child = fork();
        if (child == 0) {
            setenv("QITRMC_SIM_STATE", path.c_str(), 1);
            setenv("QITRMC_SIM_CHASSIS", chassis.c_str(), 1);
            body();
            std::fflush(nullptr);
            _exit(testing::Test::HasFailure() ? 1 : 0);
        }
        return child;
    }

    // Runs body in a process of its own to its end. Returns what it wrote to standard error.
    std::string run(const std::function<void()>& body) const {
        const ChassisFile errors("");
        const pid_t child = start([&] {
            EXPECT_NE(std::freopen(errors.path.c_str(), "w", stderr), nullptr);
            body();
        });
        int result = -1;
        EXPECT_EQ(waitpid(child, &result, 0), child);
        EXPECT_EQ(result, 0) << contentOf(errors.path);
        return contentOf(errors.path);
    }

    std::string path;
    // The chassis file; empty for the built-in chassis.
    std::string chassis;
};

using Bytes = std::vector<std::uint8_t>;

inline Bytes readArea(Handle session, const char* area, std::uint32_t size) {
    Bytes bytes(size);
    Status status;
    nQITRMCAPI100_getNvmemBytes(session, area, 0, bytes.data(), size, &status);
    EXPECT_EQ(status.code, 0) << status.text();
    return bytes;
}

inline Outcome writeArea(Handle session, const char* area, const Bytes& bytes) {
    Status status;
    nQITRMCAPI100_setNvmemBytes(session, area, 0, bytes.data(),
                                static_cast<std::uint32_t>(bytes.size()), "", "", &status);
    return {status.code, status.text()};
}

inline Outcome commitNvmem(Handle session, const char* resources) {
    Status status;
    nQITRMCAPI100_commitNvmemGeneric(session, resources, &status);
    return {status.code, status.text()};
}

inline Outcome commitProperties(Handle session, const char* resources) {
    Status status;
    nQITRMCAPI100_commitPropertiesGeneric(session, resources, &status);
    return {status.code, status.text()};
}

inline Outcome renameDevice(Handle session, const char* device, const char* name) {
    Status status;
    nQITRMCAPI100_renameDevice(session, device, name, &status);
    return {status.code, status.text()};
}

inline std::uint64_t changeCount(Handle session) {
    Status status;
    std::uint64_t count = 0;
    nQITRMCAPI100_getSystemPropertyUInt64(session, "Sys.ConfigChangeCount", &count, &status);
    EXPECT_EQ(status.code, 0) << status.text();
    return count;
}

// The result of opening a session.
inline Outcome openSession() {
    Status status;
    Handle handle = 0;
    nQITRMCAPI100_initializeSessionWithoutResources(&handle, &status);
    return {status.code, status.text()};
}

}  // namespace drivertest
