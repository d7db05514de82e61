#pragma once

#include "ChassisFile.h"
#include "Driver.h"
#include "support/TestPaths.h"

// The result of loading a chassis file in a new process. openProbe is its command.
namespace drivertest {

struct Probe {
    std::string output;
    std::string errors;
};

inline std::string contentOf(const std::string& path) {
    std::ifstream file(path);
    return std::string(std::istreambuf_iterator<char>(file), {});
}

// Opens a session in a new process that uses this chassis file and further variables of the
// environment, in the syntax of a shell.
inline Probe openWith(const std::string& path, const std::string& variables = "") {
    const ChassisFile output("");
    const ChassisFile errors("");
    const std::string command = variables + " QITRMC_SIM_CHASSIS='" + path + "' " + openProbe +
                                " >" + output.path + " 2>" + errors.path;
    EXPECT_EQ(std::system(command.c_str()), 0) << contentOf(errors.path);
    return {contentOf(output.path), contentOf(errors.path)};
}

// A text as it is written inside a JSON text.
inline std::string escaped(const std::string& text) {
    std::string inside;
    for (const char c : text) {
        inside += c == '"' || c == '\\' ? std::string{'\\', c} : std::string{c};
    }
    return inside;
}

inline void expectFault(const std::string& text, const std::string& pointer,
                        const std::string& words) {
    const ChassisFile file(text);
    const Probe probe = openWith(file.path);
    EXPECT_EQ(probe.output, "-250952\n" +
                                detailsOf("chassisNotLoaded",
                                          usage("FileName", "\"" + file.path + "\"") + "," +
                                              usage("JsonDocPointer", "\"" + pointer + "\"") + "," +
                                              usage("Details", "\"" + escaped(words) + "\"")) +
                                "\n0 0 0\n");
    EXPECT_EQ(probe.errors, "qitrmcapi: " + file.path + ": " + pointer +
                                (pointer.empty() ? "" : " ") + words + "\n");
}

inline std::string device(const std::string& members) {
    return "{\"devices\":[{\"name\":\"A\",\"category\":1" + members + "}]}";
}

}  // namespace drivertest
