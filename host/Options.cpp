#include "host/Options.h"

#include <charconv>
#include <limits>

#include "host/Failure.h"

namespace host {

namespace {

uint32_t parseNumber(const std::string& option, const std::string& text, uint32_t least,
                     uint32_t most) {
    uint32_t number = 0;
    const char* end = text.data() + text.size();
    const auto [stop, error] = std::from_chars(text.data(), end, number);
    if (error != std::errc() || stop != end || number < least || number > most) {
        throw UsageError(option + " takes a number from " + std::to_string(least) + " to " +
                         std::to_string(most) + ", not \"" + text + "\".");
    }
    return number;
}

// Takes the brackets off an IPv6 address. Empty when `text` is not an address as one writes it in
// front of a port.
std::string parseAddress(const std::string& text) {
    if (text.size() > 2 && text.front() == '[' && text.back() == ']')
        return text.substr(1, text.size() - 2);
    return text.find_first_of("[]:") == std::string::npos ? text : std::string();
}

void setListen(Options& options, const std::string& option, const std::string& text) {
    const std::size_t colon = text.rfind(':');
    const std::string address = parseAddress(text.substr(0, colon));
    if (colon == std::string::npos || address.empty()) {
        throw UsageError(option + " takes ADDR:PORT, such as 127.0.0.1:8080 or [::1]:8080, not \"" +
                         text + "\".");
    }
    const uint32_t port = parseNumber(option + " ADDR:PORT", text.substr(colon + 1), 0, 65535);
    options.address = address;
    options.port = std::to_string(port);
}

void setThreads(Options& options, const std::string& option, const std::string& text) {
    options.threads = parseNumber(option, text, 1, kMostThreads);
}

void setMaxBody(Options& options, const std::string& option, const std::string& text) {
    options.maxBody = parseNumber(option, text, 1, std::numeric_limits<uint32_t>::max());
}

void setTimeout(Options& options, const std::string& option, const std::string& text) {
    options.timeout = parseNumber(option, text, 1, kLongestTimeout);
}

// The driver reads the texts that follow, so they are only looked at here.

void setSeed(Options& options, const std::string& option, const std::string& text) {
    uint64_t seed = 0;
    const char* end = text.data() + text.size();
    const auto [stop, error] = std::from_chars(text.data(), end, seed);
    if (error != std::errc() || stop != end) {
        throw UsageError(option + " takes a number from 0 to 18446744073709551615, not \"" + text +
                         "\".");
    }
    options.seed = text;
}

void setTimeScale(Options& options, const std::string& option, const std::string& text) {
    double factor = 0.0;
    const char* end = text.data() + text.size();
    const auto [stop, error] = std::from_chars(text.data(), end, factor);
    const bool isFactor = error == std::errc() && stop == end && factor >= kSmallestTimeScale &&
                          factor <= kLargestTimeScale;
    if (!isFactor && text != "calls") {
        throw UsageError(option +
                         " takes a number from 0.001 to 1000000 or the word calls, not \"" + text +
                         "\".");
    }
    options.timeScale = text;
}

template <std::string Options::*path>
void setPath(Options& options, const std::string& option, const std::string& text) {
    if (text.empty())
        throw UsageError(option + " takes a path, not an empty text.");
    options.*path = text;
}

struct OptionWithValue {
    const char* name;
    void (*set)(Options& options, const std::string& option, const std::string& text);
};

constexpr OptionWithValue kOptionsWithValue[] = {
    {"--listen", setListen},
    {"--plugin", setPath<&Options::plugin>},
    {"--chassis", setPath<&Options::chassis>},
    {"--state", setPath<&Options::state>},
    {"--faults", setPath<&Options::faults>},
    {"--trace", setPath<&Options::trace>},
    {"--seed", setSeed},
    {"--time-scale", setTimeScale},
    {"--threads", setThreads},
    {"--max-body", setMaxBody},
    {"--timeout", setTimeout},
    {"--tls-cert", setPath<&Options::tlsCertificate>},
    {"--tls-key", setPath<&Options::tlsKey>},
};

const OptionWithValue& findOption(const std::string& name) {
    for (const OptionWithValue& option : kOptionsWithValue) {
        if (name == option.name)
            return option;
    }
    throw UsageError("Unknown argument \"" + name + "\". Try --help.");
}

void requireBothTlsFiles(const Options& options) {
    if (options.tlsCertificate.empty() != options.tlsKey.empty())
        throw UsageError("--tls-cert and --tls-key are given together or not at all.");
}

}  // namespace

Options parseOptions(const std::vector<std::string>& arguments) {
    Options options;
    for (auto argument = arguments.begin(); argument != arguments.end(); ++argument) {
        if (*argument == "--help" || *argument == "--version") {
            options.action = *argument == "--help" ? Action::ShowHelp : Action::ShowVersion;
            return options;
        }
        const std::size_t equals = argument->find('=');
        const std::string name = argument->substr(0, equals);
        const OptionWithValue& option = findOption(name);
        if (equals != std::string::npos) {
            option.set(options, name, argument->substr(equals + 1));
            continue;
        }
        if (++argument == arguments.end())
            throw UsageError(name + " needs a value. Try --help.");
        option.set(options, name, *argument);
    }
    requireBothTlsFiles(options);
    return options;
}

}  // namespace host
