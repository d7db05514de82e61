#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace host {

// What the command line asks for.
struct Options {
    std::string notice;                 // --help, --version: what to print instead of serving
    std::string address = "127.0.0.1";  // a name or number, IPv6 without its brackets
    std::string port = "8080";          // decimal; "0" takes a free one
    std::string plugin;                 // path; empty: look beside the program
    std::string web;                    // folder; empty: look beside the program
    std::string chassis;                // path; empty: leave the driver's own choice
    std::string state;                  // path; empty: leave the driver's own choice
    std::string faults;                 // path; empty: leave the driver's own choice
    std::string trace;                  // path; empty: leave the driver's own choice
    std::string seed;                   // 64-bit number; empty: leave the driver's own choice
    std::string timeScale;              // number or "calls"; empty: leave the driver's own choice
    std::uint32_t threads = 512;        // 1 to mostThreads
    std::uint32_t connections = 16384;  // 1 to mostConnections
    std::uint32_t maxBody = 16 * 1024 * 1024;  // bytes, 1 and more
    std::uint32_t timeout = 30;                // seconds, 1 to longestTimeout
    std::vector<std::string> hostNames;        // names of this machine besides its addresses
    std::vector<std::string> allowedOrigins;   // origins of web pages that may send requests
    std::string tlsCertificate;                // path; both or neither of the two
    std::string tlsKey;
    bool passTransport = false;  // the plug-in sees "https" behind TLS
    bool noHealth = false;       // no /healthz
    bool noPanel = false;        // no /simulator/
    bool noMetrics = false;      // no /metrics, and nothing is counted
};

constexpr std::uint32_t mostThreads = 900;
constexpr std::uint32_t mostConnections = 1000000;
constexpr std::uint32_t longestTimeout = 86400;
// Simulated seconds in one real second.
constexpr double smallestTimeScale = 0.001;
constexpr double largestTimeScale = 1000000.0;

// Reads the arguments of the program, its own name not among them. Options are written as
// "--name value" or "--name=value"; the last one of a name holds, except for those that may be
// repeated. --help and --version end the reading. Throws UsageError.
Options parseOptions(const std::vector<std::string>& arguments);

}  // namespace host
