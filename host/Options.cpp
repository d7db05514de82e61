#include "host/Options.h"

#include <CLI/CLI.hpp>
#include <algorithm>
#include <charconv>
#include <limits>
#include <memory>

#include "host/Failure.h"
#include "host/Origin.h"

namespace host {

namespace {

constexpr const char* introduction = R"(Usage: qitrmc-host [OPTION]...

Serves the web service plug-in of an instrument chassis over HTTP, for development and tests.
The service answers POST requests at /qitrmc/Call; GET /openrpc.json describes it for machines.
A page for a browser is at /, GET /healthz says whether the service works, GET /metrics counts.
)";

constexpr const char* notes =
    R"(SIGTERM and SIGINT end the host after the requests in flight; a second signal ends it at once.
Exit status: 0 after a normal end, 1 when it cannot serve, 2 for a wrong command line.)";

constexpr const char* versionText = "qitrmc-host " QITRMC_VERSION "\n";

std::uint32_t parseNumber(const std::string& option, const std::string& text, std::uint32_t least,
                          std::uint32_t most) {
    std::uint32_t number = 0;
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
    if (text.size() > 2 && text.front() == '[' && text.back() == ']') {
        return text.substr(1, text.size() - 2);
    }
    return text.find_first_of("[]:") == std::string::npos ? text : std::string();
}

void setListen(Options& options, const std::string& option, const std::string& text) {
    const std::size_t colon = text.rfind(':');
    const std::string address = parseAddress(text.substr(0, colon));
    if (colon == std::string::npos || address.empty()) {
        throw UsageError(option + " takes ADDR:PORT, such as 127.0.0.1:8080 or [::1]:8080, not \"" +
                         text + "\".");
    }
    const std::uint32_t port = parseNumber(option + " ADDR:PORT", text.substr(colon + 1), 0, 65535);
    options.address = address;
    options.port = std::to_string(port);
}

void setThreads(Options& options, const std::string& option, const std::string& text) {
    options.threads = parseNumber(option, text, 1, mostThreads);
}

void setConnections(Options& options, const std::string& option, const std::string& text) {
    options.connections = parseNumber(option, text, 1, mostConnections);
}

void setMaxBody(Options& options, const std::string& option, const std::string& text) {
    options.maxBody = parseNumber(option, text, 1, std::numeric_limits<std::uint32_t>::max());
}

void setTimeout(Options& options, const std::string& option, const std::string& text) {
    options.timeout = parseNumber(option, text, 1, longestTimeout);
}

// The driver reads the texts that follow, so they are only looked at here.

void setSeed(Options& options, const std::string& option, const std::string& text) {
    std::uint64_t seed = 0;
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
    const bool isFactor = error == std::errc() && stop == end && factor >= smallestTimeScale &&
                          factor <= largestTimeScale;
    if (!isFactor && text != "calls") {
        throw UsageError(option +
                         " takes a number from 0.001 to 1000000 or the word calls, not \"" + text +
                         "\".");
    }
    options.timeScale = text;
}

template <std::string Options::*path>
void setPath(Options& options, const std::string& option, const std::string& text) {
    if (text.empty()) {
        throw UsageError(option + " takes a path, not an empty text.");
    }
    options.*path = text;
}

void addHostName(Options& options, const std::string& option, const std::string& text) {
    const bool bracketed = text.size() > 2 && text.front() == '[' && text.back() == ']';
    const std::string name =
        canonicalHost(bracketed ? text.substr(1, text.size() - 2) : text).value_or("");
    if (name.empty()) {
        throw UsageError(option +
                         " takes a name or address without a port, such as lab-pc.example, not \"" +
                         text + "\".");
    }
    options.hostNames.push_back(name);
}

void addOrigin(Options& options, const std::string& option, const std::string& text) {
    if (!parseOrigin(text)) {
        throw UsageError(option +
                         " takes SCHEME://HOST[:PORT], such as http://localhost:3000, not \"" +
                         text + "\".");
    }
    options.allowedOrigins.push_back(text);
}

struct OptionWithValue {
    const char* name;
    const char* value;
    const char* description;
    void (*set)(Options& options, const std::string& option, const std::string& text);
};

constexpr OptionWithValue optionsWithValue[] = {
    {"--listen", "ADDR:PORT",
     "where to listen (127.0.0.1:8080); port 0 takes a free one,\n"
     "an IPv6 address stands in brackets",
     setListen},
    {"--plugin", "PATH",
     "the plug-in (libqitrmcsvc.so in ../lib beside the program's\n"
     "folder, or in it)",
     setPath<&Options::plugin>},
    {"--web", "DIR",
     "the page for a browser, served at / (../share/web beside the\n"
     "program's folder); its files are read once, at the start",
     setPath<&Options::web>},
    {"--chassis", "FILE",
     "the chassis that the simulated driver shows\n"
     "(QITRMC_SIM_CHASSIS)",
     setPath<&Options::chassis>},
    {"--state", "DIR", "where the simulated driver keeps its state\n(QITRMC_SIM_STATE)",
     setPath<&Options::state>},
    {"--faults", "FILE",
     "what the simulated driver does wrong on purpose\n"
     "(QITRMC_SIM_FAULTS); the file may change, come and go while\n"
     "the host runs",
     setPath<&Options::faults>},
    {"--trace", "FILE",
     "where the simulated driver notes each call of it, \"-\" for\n"
     "standard error (QITRMC_SIM_TRACE)",
     setPath<&Options::trace>},
    {"--seed", "N",
     "where the random numbers of the simulated chassis come\n"
     "from: the same seed gives the same numbers (QITRMC_SIM_SEED;\n"
     "0 to 18446744073709551615)",
     setSeed},
    {"--time-scale", "X",
     "simulated seconds in one real second\n"
     "(QITRMC_SIM_TIME_SCALE; 0.001 to 1000000), or \"calls\": time\n"
     "goes by the calls of the driver alone",
     setTimeScale},
    {"--threads", "N", "most requests that are worked on at once (512; 1 to 900)", setThreads},
    {"--connections", "N",
     "most connections at once (16384; 1 to 1000000, each takes up to two\n"
     "file descriptors)",
     setConnections},
    {"--max-body", "BYTES",
     "largest request body; a larger one is answered with 413\n"
     "(16777216)",
     setMaxBody},
    {"--timeout", "SECONDS",
     "how long a client may stay idle, and how long it may take to\n"
     "send the head of a request, to send its body and to fetch\n"
     "the response (30)",
     setTimeout},
    {"--host-name", "NAME",
     "a name under which clients reach this machine; requests\n"
     "whose Host is neither that, nor localhost or another\n"
     "loopback address, nor the address they came to, are\n"
     "answered with 403 (may be repeated)",
     addHostName},
    {"--allow-origin", "ORIGIN",
     "lets web pages of this origin send requests, such as\n"
     "http://localhost:3000; those of others are answered with 403\n"
     "(may be repeated)",
     addOrigin},
    {"--tls-cert", "FILE", "serve HTTPS with this certificate chain in PEM form...",
     setPath<&Options::tlsCertificate>},
    {"--tls-key", "FILE", "...and this private key", setPath<&Options::tlsKey>},
};

void describeOptionsWithValue(CLI::App& app, Options& options) {
    for (const OptionWithValue& option : optionsWithValue) {
        const auto take = [&options, &option](const CLI::results_t& values) {
            for (const std::string& value : values) {
                option.set(options, option.name, value);
            }
            return true;
        };
        app.add_option(option.name, take, option.description)
            ->type_name(option.value)
            ->multi_option_policy(CLI::MultiOptionPolicy::TakeAll);
    }
}

void describeFlags(CLI::App& app, Options& options) {
    app.add_flag("--pass-transport", options.passTransport,
                 "shows the plug-in that a request came over HTTPS, which it\n"
                 "refuses; it sees plain HTTP without this option");
    app.add_flag("--no-health", options.noHealth,
                 "leaves out /healthz, which says whether the service works");
    app.add_flag("--no-metrics", options.noMetrics,
                 "leaves out /metrics, which counts requests in the text\n"
                 "format of Prometheus");
    app.add_flag("--no-panel", options.noPanel,
                 "leaves out /simulator/, by which clients on this machine pull\n"
                 "modules of the simulated chassis, set faults and see the trace");
    app.set_help_flag();
    app.add_flag_callback(
           "-h,--help", [] { throw CLI::CallForHelp(); }, "show this text")
        ->trigger_on_parse();
    app.add_flag_callback(
           "--version", [] { throw CLI::CallForVersion(); }, "show the version")
        ->trigger_on_parse();
}

struct HelpLayout : CLI::Formatter {
    HelpLayout() { column_width(24); }
    std::string make_usage(const CLI::App*, std::string) const override { return introduction; }
};

// The parser takes the argument behind "--name=" for the value; it is the empty text.
std::vector<std::string> withEmptyValues(const std::vector<std::string>& arguments) {
    std::vector<std::string> separated;
    for (const std::string& argument : arguments) {
        const bool isEmptyValue = argument.rfind("--", 0) == 0 && !argument.empty() &&
                                  argument.find('=') == argument.size() - 1;
        separated.push_back(isEmptyValue ? argument.substr(0, argument.size() - 1) : argument);
        if (isEmptyValue) {
            separated.emplace_back();
        }
    }
    return separated;
}

void requireBothTlsFiles(const Options& options) {
    if (options.tlsCertificate.empty() != options.tlsKey.empty()) {
        throw UsageError("--tls-cert and --tls-key are given together or not at all.");
    }
}

}  // namespace

Options parseOptions(const std::vector<std::string>& arguments) {
    Options options;
    CLI::App app;
    app.formatter(std::make_shared<HelpLayout>());
    app.footer(notes);
    describeOptionsWithValue(app, options);
    describeFlags(app, options);
    std::vector<std::string> backwards = withEmptyValues(arguments);
    std::reverse(backwards.begin(), backwards.end());
    try {
        app.parse(std::move(backwards));
    } catch (const CLI::CallForHelp&) {
        options.notice = app.help();
    } catch (const CLI::CallForVersion&) {
        options.notice = versionText;
    } catch (const CLI::ExtrasError&) {
        throw UsageError("Unknown argument \"" + app.remaining().front() + "\". Try --help.");
    } catch (const CLI::ParseError& error) {
        throw UsageError(error.what() + std::string(". Try --help."));
    }
    requireBothTlsFiles(options);
    return options;
}

}  // namespace host
